#include "media/exif.h"

#include <fstream>

#include "media/byte_order.h"

namespace dehaze {
namespace {

// A TIFF structure (TIFF 6.0, EXIF 2.3): byte order, offset of the first directory; a directory has
// a count, entries of 12 bytes (tag, type, count, value or offset) and the offset of the next one.
constexpr size_t kHeader = 8;
constexpr size_t kEntry = 12;

constexpr uint32_t kTagWidth = 0x0100;
constexpr uint32_t kTagHeight = 0x0101;
constexpr uint32_t kTagOrientation = 0x0112;
constexpr uint32_t kTagExifDirectory = 0x8769;
constexpr uint32_t kTagPixelWidth = 0xA002;
constexpr uint32_t kTagPixelHeight = 0xA003;

constexpr uint32_t kShort = 3;
constexpr uint32_t kLong = 4;

class TiffEditor {
 public:
  TiffEditor(Bytes& bytes, int width, int height)
      : bytes_(bytes),
        width_(static_cast<uint32_t>(width)),
        height_(static_cast<uint32_t>(height)) {}

  bool edit() {
    if (has_text(bytes_, 0, std::string("II*\0", 4))) {
      is_big_endian_ = false;
    } else if (has_text(bytes_, 0, std::string("MM\0*", 4))) {
      is_big_endian_ = true;
    } else {
      return false;
    }
    if (bytes_.size() < kHeader) return false;
    uint32_t camera = 0;
    size_t end = 0;
    if (!edit_directory(number(4, 4), camera, end)) return false;
    // The next directory is that of the thumbnail. Some writers leave the field out.
    if (bytes_.size() - end >= 4) set(end, 4, 0);
    uint32_t nested = 0;
    return camera == 0 || edit_directory(camera, nested, end);
  }

 private:
  uint32_t number(size_t position, int count) const {
    return read_number(&bytes_[position], count, is_big_endian_);
  }
  void set(size_t position, int count, uint32_t value) {
    write_number(&bytes_[position], count, is_big_endian_, value);
  }

  // `end`: behind its entries.
  bool edit_directory(size_t begin, uint32_t& camera, size_t& end) {
    if (begin < kHeader || begin > bytes_.size() || bytes_.size() - begin < 2) return false;
    const size_t entries = number(begin, 2);
    if (entries > (bytes_.size() - begin - 2) / kEntry) return false;
    for (size_t i = 0; i < entries; ++i) edit_entry(begin + 2 + i * kEntry, camera);
    end = begin + 2 + entries * kEntry;
    return true;
  }

  void edit_entry(size_t entry, uint32_t& camera) {
    const uint32_t type = number(entry + 2, 2);
    if ((type != kShort && type != kLong) || number(entry + 4, 4) != 1) return;
    const int size = type == kShort ? 2 : 4;
    switch (number(entry, 2)) {
      case kTagOrientation:
        return set(entry + 8, size, 1);
      case kTagWidth:
      case kTagPixelWidth:
        return set(entry + 8, size, width_);
      case kTagHeight:
      case kTagPixelHeight:
        return set(entry + 8, size, height_);
      case kTagExifDirectory:
        camera = number(entry + 8, size);
        return;
      default:
        return;
    }
  }

  Bytes& bytes_;
  uint32_t width_;
  uint32_t height_;
  bool is_big_endian_ = true;
};

}  // namespace

Bytes find_exif(const Bytes& file) {
  for (const auto find : {jpeg_exif, png_exif, webp_exif}) {
    Bytes exif = find(file);
    if (!exif.empty()) return exif;
  }
  return {};
}

Bytes read_exif(const std::string& path) {
  std::ifstream file(path, std::ios::binary | std::ios::ate);
  const std::streamoff size = file ? static_cast<std::streamoff>(file.tellg()) : 0;
  if (size <= 0) return {};
  Bytes bytes(static_cast<size_t>(size));
  file.seekg(0);
  if (!file.read(reinterpret_cast<char*>(bytes.data()), size)) return {};
  return find_exif(bytes);
}

bool make_exif_upright(Bytes& exif, int width, int height) {
  return TiffEditor(exif, width, height).edit();
}

}  // namespace dehaze
