// Recovery of whole YUV 4:2:0 frames in place.
#pragma once

#include <stdint.h>

#include "recover/recovery_tables.h"

namespace haze::recover {

// A half-resolution map of transmission codes; rows start `row_bytes` apart.
struct CodeMap {
  const uint8_t* codes;
  int row_bytes;
};

enum class ChromaLayout {
  kInterleavedVu,  // NV21
  kPlanarUv,       // I420
};

// Rewrites a frame of width x height pixels, both even. Tables are taken from `kept`, where there
// are any; otherwise they are built for the call.
void recover_frame(uint8_t* frame, CodeMap map, int width, int height, ChromaLayout layout,
                   LightAnchor anchor, KeptTables* kept);

}  // namespace haze::recover
