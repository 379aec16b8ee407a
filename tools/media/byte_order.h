// Numbers in files, by byte order.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace dehaze {

// Of `count` bytes at most 4.
inline uint32_t read_number(const uint8_t* bytes, int count, bool is_big_endian) {
  uint32_t value = 0;
  for (int i = 0; i < count; ++i) {
    value = value << 8 | bytes[is_big_endian ? i : count - 1 - i];
  }
  return value;
}

inline void write_number(uint8_t* bytes, int count, bool is_big_endian, uint32_t value) {
  for (int i = 0; i < count; ++i) {
    bytes[is_big_endian ? count - 1 - i : i] = static_cast<uint8_t>(value >> (8 * i));
  }
}

inline void append_number(std::vector<uint8_t>& bytes, int count, bool is_big_endian,
                          uint32_t value) {
  bytes.resize(bytes.size() + static_cast<size_t>(count));
  write_number(bytes.data() + bytes.size() - count, count, is_big_endian, value);
}

inline void append_text(std::vector<uint8_t>& bytes, const std::string& text) {
  bytes.insert(bytes.end(), text.begin(), text.end());
}

inline void append_bytes(std::vector<uint8_t>& bytes, const std::vector<uint8_t>& more) {
  bytes.insert(bytes.end(), more.begin(), more.end());
}

// True if the text stands at that position.
inline bool has_text(const std::vector<uint8_t>& bytes, size_t position, const std::string& text) {
  return position <= bytes.size() && text.size() <= bytes.size() - position &&
         std::string(bytes.begin() + static_cast<std::ptrdiff_t>(position),
                     bytes.begin() + static_cast<std::ptrdiff_t>(position + text.size())) == text;
}

// Bytes [begin, begin + size), which lie in `bytes`.
inline std::vector<uint8_t> part_of(const std::vector<uint8_t>& bytes, size_t begin, size_t size) {
  const auto first = bytes.begin() + static_cast<std::ptrdiff_t>(begin);
  return std::vector<uint8_t>(first, first + static_cast<std::ptrdiff_t>(size));
}

}  // namespace dehaze
