// What cameras write about a picture.
#pragma once

#include <string>

#include "media/picture_blocks.h"

namespace dehaze {

// Of a picture file, empty if there is none.
Bytes read_exif(const std::string& path);

// For the same picture turned upright, in that size: the orientation becomes 1, sizes are
// corrected, and the thumbnail, which shows the haze, is cut off. False if the data is damaged.
bool make_exif_upright(Bytes& exif, int width, int height);

}  // namespace dehaze
