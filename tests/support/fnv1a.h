// FNV-1a, 64 bits: a digest for golden results.
#pragma once

#include <cstddef>
#include <cstdint>

namespace haze::test {

class Fnv1a {
 public:
  void add(const uint8_t* bytes, size_t count) {
    for (size_t i = 0; i < count; ++i) hash_ = (hash_ ^ bytes[i]) * 0x100000001B3u;
  }
  uint64_t value() const { return hash_; }

 private:
  uint64_t hash_ = 0xCBF29CE484222325u;
};

}  // namespace haze::test
