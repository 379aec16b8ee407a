// One row of 2 x 2 blocks of a YUV 4:2:0 frame.
#pragma once

#include <stdint.h>

namespace haze::recover {

// Two luma rows and the chroma samples that belong to them. In NV21 frames V and U alternate, V
// first.
struct BlockRow {
  uint8_t* luma_top;
  uint8_t* luma_bottom;
  uint8_t* v;
  uint8_t* u;
};

}  // namespace haze::recover
