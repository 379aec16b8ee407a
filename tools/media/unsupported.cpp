#include "media/unsupported.h"

#include <fstream>
#include <set>

#include "output_kind.h"

namespace dehaze {
namespace {

constexpr size_t kHeadBytes = 4096;

std::string head_of(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  std::string head(kHeadBytes, '\0');
  file.read(head.data(), static_cast<std::streamsize>(head.size()));
  head.resize(static_cast<size_t>(file.gcount()));
  return head;
}

bool is_camera_raw(const std::string& path) {
  static const std::set<std::string> kExtensions = {".3fr", ".arw", ".cr2", ".cr3", ".dng", ".nef",
                                                    ".nrw", ".orf", ".pef", ".raf", ".rw2", ".srw"};
  return kExtensions.count(extension_of(path)) > 0;
}

// RFC 9649: VP8X with the animation flag.
bool is_animated_webp(const std::string& head) {
  constexpr size_t kFlags = 20;
  constexpr unsigned char kAnimation = 0x02;
  return head.size() > kFlags && head.compare(0, 4, "RIFF") == 0 &&
         head.compare(8, 8, "WEBPVP8X") == 0 &&
         (static_cast<unsigned char>(head[kFlags]) & kAnimation) != 0;
}

// ISO/IEC 23008-12: the brand behind "ftyp".
bool is_heif(const std::string& head) {
  if (head.size() < 12 || head.compare(4, 4, "ftyp") != 0) return false;
  static const std::set<std::string> kBrands = {"heic", "heix", "heim", "heis", "mif1", "avif"};
  return kBrands.count(head.substr(8, 4)) > 0;
}

}  // namespace

std::string unsupported_kind(const std::string& path) {
  if (is_camera_raw(path)) {
    return "camera raw files are not read; develop them to TIFF or PNG first";
  }
  const std::string head = head_of(path);
  if (is_animated_webp(head)) {
    return "animated WebP is not read; convert it to GIF, APNG or a video first";
  }
  if (is_heif(head)) return "HEIC and AVIF pictures are not read; convert them to PNG first";
  return "";
}

}  // namespace dehaze
