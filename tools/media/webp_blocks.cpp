// WebP (RFC 9649): a RIFF file of chunks with little-endian lengths, padded to even ones. Files
// with more than the picture begin with a VP8X chunk that tells what else there is.
#include "media/byte_order.h"
#include "media/picture_blocks.h"

namespace dehaze {
namespace {

constexpr size_t kRiffHeader = 12;
constexpr size_t kChunkHeader = 8;
constexpr size_t kExtendedSize = 10;  // of the data of VP8X
const std::string kExifWord = std::string("Exif\0\0", 6);

// Flags of VP8X.
constexpr uint8_t kHasProfile = 0x20;
constexpr uint8_t kHasExif = 0x08;

bool is_webp(const Bytes& file) { return has_text(file, 0, "RIFF") && has_text(file, 8, "WEBP"); }

void append_chunk(Bytes& file, const std::string& type, const Bytes& data) {
  append_text(file, type);
  append_number(file, 4, false, static_cast<uint32_t>(data.size()));
  append_bytes(file, data);
  if (data.size() % 2 != 0) file.push_back(0);
}

// The data of VP8X: flags, three reserved bytes, width - 1 and height - 1.
Bytes extended_header(uint8_t flags, int width, int height) {
  Bytes data = {flags, 0, 0, 0};
  append_number(data, 3, false, static_cast<uint32_t>(width - 1));
  append_number(data, 3, false, static_cast<uint32_t>(height - 1));
  return data;
}

}  // namespace

Bytes webp_exif(const Bytes& file) {
  if (!is_webp(file)) return {};
  size_t position = kRiffHeader;
  while (file.size() - position >= kChunkHeader) {
    const size_t length = read_number(&file[position + 4], 4, false);
    const size_t begin = position + kChunkHeader;
    if (length > file.size() - begin) return {};
    if (has_text(file, position, "EXIF")) {
      // Some writers put the word of JPEG files before it.
      const size_t skip =
          length >= kExifWord.size() && has_text(file, begin, kExifWord) ? kExifWord.size() : 0;
      return part_of(file, begin + skip, length - skip);
    }
    position = begin + length + length % 2;
    if (position > file.size()) return {};
  }
  return {};
}

Bytes webp_with_blocks(const Bytes& file, const Bytes& exif, const Bytes& profile, int width,
                       int height) {
  if (!is_webp(file) || (exif.empty() && profile.empty())) return file;
  uint8_t flags = 0;
  size_t rest = kRiffHeader;
  if (has_text(file, rest, "VP8X") && file.size() >= rest + kChunkHeader + kExtendedSize) {
    flags = file[rest + kChunkHeader];
    rest += kChunkHeader + kExtendedSize;
  }
  if (!profile.empty()) flags |= kHasProfile;
  if (!exif.empty()) flags |= kHasExif;
  Bytes result = part_of(file, 0, kRiffHeader);
  append_chunk(result, "VP8X", extended_header(flags, width, height));
  // In this order: profile, picture, EXIF.
  if (!profile.empty()) append_chunk(result, "ICCP", profile);
  append_bytes(result, part_of(file, rest, file.size() - rest));
  if (!exif.empty()) append_chunk(result, "EXIF", exif);
  write_number(&result[4], 4, false, static_cast<uint32_t>(result.size() - 8));
  return result;
}

}  // namespace dehaze
