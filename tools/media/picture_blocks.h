// The blocks of picture files that lie beside the pixels and that FFmpeg's encoders leave out: EXIF
// in JPEG, PNG and WebP, the colour profile in WebP.
#pragma once

#include <cstdint>
#include <vector>

namespace dehaze {

using Bytes = std::vector<uint8_t>;

// EXIF as a TIFF structure, without the words that containers put before it. Empty if the file has
// none, is damaged or of another kind.
Bytes find_exif(const Bytes& file);

// One per container. They return `file` as it is if it is not what it should be.
Bytes jpeg_exif(const Bytes& file);
Bytes jpeg_with_exif(const Bytes& file, const Bytes& exif);
// More does not fit into a segment of a JPEG file.
constexpr size_t kLargestJpegExif = 65535 - 2 - 6;

Bytes png_exif(const Bytes& file);
Bytes png_with_exif(const Bytes& file, const Bytes& exif);

Bytes webp_exif(const Bytes& file);
// Either may be empty.
Bytes webp_with_blocks(const Bytes& file, const Bytes& exif, const Bytes& profile, int width,
                       int height);

}  // namespace dehaze
