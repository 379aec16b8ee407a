// PNG (ISO/IEC 15948): chunks of length, type, data and CRC-32 of type and data. EXIF is an eXIf
// chunk (an extension of 2017).
extern "C" {
#include <libavutil/crc.h>
}

#include "media/byte_order.h"
#include "media/picture_blocks.h"

namespace dehaze {
namespace {

const std::string kSignature = "\x89PNG\r\n\x1A\n";
constexpr size_t kOverhead = 12;  // length, type and CRC
constexpr size_t kHeaderChunk = 13 + kOverhead;

uint32_t crc_of(const uint8_t* bytes, size_t size) {
  return ~av_crc(av_crc_get_table(AV_CRC_32_IEEE_LE), ~0u, bytes, size);
}

}  // namespace

Bytes png_exif(const Bytes& file) {
  if (!has_text(file, 0, kSignature)) return {};
  size_t position = kSignature.size();
  while (file.size() - position >= kOverhead) {
    const size_t length = read_number(&file[position], 4, true);
    if (length > file.size() - position - kOverhead) return {};
    if (has_text(file, position + 4, "eXIf")) return part_of(file, position + 8, length);
    position += kOverhead + length;
  }
  return {};
}

Bytes png_with_exif(const Bytes& file, const Bytes& exif) {
  const size_t position = kSignature.size() + kHeaderChunk;
  if (!has_text(file, 0, kSignature) || file.size() < position) return file;
  Bytes result = part_of(file, 0, position);
  append_number(result, 4, true, static_cast<uint32_t>(exif.size()));
  append_text(result, "eXIf");
  append_bytes(result, exif);
  append_number(result, 4, true, crc_of(&result[position + 4], 4 + exif.size()));
  append_bytes(result, part_of(file, position, file.size() - position));
  return result;
}

}  // namespace dehaze
