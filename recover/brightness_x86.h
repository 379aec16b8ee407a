// Vector path of the brightness lift for x86-64, by vector type.
#pragma once

#include <stddef.h>
#include <stdint.h>

namespace haze::recover {

// Looks up the first byte of every 2-byte pixel; returns the first pixel that it did not change.
template <typename V>
size_t look_up_first_bytes_x86(uint8_t* pixels, const uint8_t* table_bytes, size_t end) {
  using Int = typename V::Int;
  const typename V::Table table(table_bytes);
  const Int first_bytes = V::set16(0x00FF);
  const Int second_bytes = V::set16(0xFF00);
  size_t i = 0;
  for (; i + V::kBytes / 2 <= end; i += V::kBytes / 2) {
    const Int both = V::load(pixels + 2 * i);
    V::store(pixels + 2 * i,
             V::bit_or(V::bit_and(table[both], first_bytes), V::bit_and(both, second_bytes)));
  }
  return i;
}

}  // namespace haze::recover
