// Output: one picture as a JPEG, PNG or WebP file.
#pragma once

#include <string>

#include "media/color_convert.h"
#include "media/ffmpeg_handles.h"
#include "media/picture_blocks.h"
#include "output_kind.h"

namespace dehaze {

// What a picture file of that kind is made from: 4:2:0 for JPEG and WebP, so that the recovered
// chroma is stored as it is, and RGB for PNG. `siting` is that of the NV21 frame.
OutputSamples picture_samples(OutputKind kind, AVChromaLocation siting);

// Encodes the frame and writes it to `path`, which exists already; an ICC profile among its side
// data is embedded. exif: as find_exif() gives it, or empty.
void write_picture(const AVFrame& frame, OutputKind kind, const std::string& path,
                   const Bytes& exif = {});

}  // namespace dehaze
