// Recovery through the library's slot tables, filled with plain J = A + (I - A) / t.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "media/nv21.h"
#include "photo/haze_judge.h"
#include "photo/planes.h"

namespace dehaze {

// One code per pixel of the share: which table recovers its 2 x 2 block.
std::vector<uint8_t> recovery_codes(const Plane& share, const Removal& removal);

// Transmission that a code stands for; 1 for blocks that stay as they are.
float transmission_of_code(uint8_t code);

// Recovers the frame in place. light: blue, green, red.
void recover(Nv21Frame& frame, std::vector<uint8_t>& codes, const std::array<double, 3>& light);

}  // namespace dehaze
