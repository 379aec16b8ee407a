// A whole file at a time.
#pragma once

#include <cstddef>
#include <string>

namespace dehaze {

// Replaces the content of a file. False with errno set if not all of it could be written.
bool write_file(const std::string& path, const void* bytes, size_t size);

}  // namespace dehaze
