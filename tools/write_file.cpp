#include "write_file.h"

#include <cstdio>

namespace dehaze {

bool write_file(const std::string& path, const void* bytes, size_t size) {
  std::FILE* const file = std::fopen(path.c_str(), "wb");
  if (file == nullptr) return false;
  const bool written = std::fwrite(bytes, 1, size, file) == size;
  // What is still buffered may fail here.
  return std::fclose(file) == 0 && written;
}

}  // namespace dehaze
