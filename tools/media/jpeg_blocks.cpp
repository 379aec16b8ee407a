// JPEG (ITU-T T.81): segments of a marker FF xx and a 16-bit length that counts itself. EXIF is an
// APP1 segment that begins with "Exif\0\0".
#include "media/byte_order.h"
#include "media/picture_blocks.h"

namespace dehaze {
namespace {

const std::string kStart = "\xFF\xD8";
const std::string kExifWord = std::string("Exif\0\0", 6);
constexpr uint8_t kApp0 = 0xE0;
constexpr uint8_t kApp1 = 0xE1;
constexpr uint8_t kStartOfScan = 0xDA;
constexpr size_t kHeader = 4;  // marker and length

struct Segment {
  uint8_t marker;
  size_t begin;  // of the marker
  size_t end;
};

// The segment at `begin`; its end is `begin` if there is none, or the scan begins.
Segment segment_at(const Bytes& file, size_t begin) {
  Segment segment = {0, begin, begin};
  if (file.size() < begin + kHeader || file[begin] != 0xFF) return segment;
  segment.marker = file[begin + 1];
  const size_t length = read_number(&file[begin + 2], 2, true);
  if (segment.marker == kStartOfScan || length < 2 || file.size() - begin - 2 < length) {
    return segment;
  }
  segment.end = begin + 2 + length;
  return segment;
}

}  // namespace

Bytes jpeg_exif(const Bytes& file) {
  if (!has_text(file, 0, kStart)) return {};
  for (Segment s = segment_at(file, 2); s.end > s.begin; s = segment_at(file, s.end)) {
    const size_t begin = s.begin + kHeader + kExifWord.size();
    if (s.marker == kApp1 && begin <= s.end && has_text(file, s.begin + kHeader, kExifWord)) {
      return part_of(file, begin, s.end - begin);
    }
  }
  return {};
}

Bytes jpeg_with_exif(const Bytes& file, const Bytes& exif) {
  if (!has_text(file, 0, kStart) || exif.size() > kLargestJpegExif) return file;
  // Right behind the JFIF header: that has to stay first, and EXIF has to come early.
  size_t position = 2;
  const Segment first = segment_at(file, position);
  if (first.marker == kApp0) position = first.end;
  Bytes result = part_of(file, 0, position);
  append_number(result, 2, true, 0xFF00u | kApp1);
  append_number(result, 2, true, static_cast<uint32_t>(2 + kExifWord.size() + exif.size()));
  append_text(result, kExifWord);
  append_bytes(result, exif);
  append_bytes(result, part_of(file, position, file.size() - position));
  return result;
}

}  // namespace dehaze
