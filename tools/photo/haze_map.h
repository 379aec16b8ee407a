// Where the haze is: its colour, and its share in every pixel.
//
// With the haze model I = J t + A (1 - t) the share of the haze is 1 - t. The dark-channel prior
// (2009) takes it for the darkest that the neighbourhood of a pixel has in any channel, relative to
// A: nearly everywhere something nearby would be black without haze. The guided filter (2010)
// brings the edges of the picture back into that map of squares. Both work on a small copy of the
// picture, so that "neighbourhood" means the same part of the view whatever the resolution; what
// the guided filter learns there is applied at half resolution (as in "Fast guided filter", 2015).
#pragma once

#include <array>

#include "media/nv21.h"
#include "media/orientation.h"
#include "photo/planes.h"

namespace dehaze {

// Blue, green, red; 1 ... 255.
using Light = std::array<uint8_t, 3>;

// One pixel for each 2 x 2 block.
BgrImage half_resolution(Nv21Frame& frame);

// The picture halved until its longer side is at most 512 pixels. Pictures of less than 16 pixels
// in one direction are not halved any further.
BgrImage reduced(const BgrImage& image);

// 0 to 1 down the picture as it is seen.
double depth_in_view(int x, int y, const BgrImage& image, const Orientation& orientation);

// Colour of the thickest haze: the mean over the brightest part of the dark channel, the upper part
// of the picture coming first.
Light estimate_light(BgrImage& small, const Orientation& orientation);

// What the guided filter learns: around each pixel of the small picture the share of the haze is
// slope * (share by the pixel alone) + offset.
struct GuidedModel {
  Plane slope;
  Plane offset;
};

GuidedModel fit_guided_model(BgrImage& small, const Light& light);

// Largest share of haze in each pixel by itself: it would take its darkest channel to 0.
Plane share_by_pixel(BgrImage& image, const Light& light);

// Share of the haze in each pixel of an image that is the small one or one that it was made from by
// reduced(). No share would bring a channel of the result beyond its range.
Plane share_of_haze(BgrImage& image, const GuidedModel& model, const Light& light);

}  // namespace dehaze
