// What each operation is meant to reach on a frame of 1280 x 720, by ratios within one run.
#pragma once

#include <string>

namespace haze::bench {

// A bound of 0 is none.
struct Bounds {
  double most_copies;      // times a copy of the frame
  double most_recoveries;  // times the frame recovery
  double least_peer;       // times faster than the peer
  double least_portable;   // times faster than the portable path
};

struct Ratios {
  double copies, recoveries, peer, portable;
};

// The bounds of an operation with AVX-512 or with AVX2; all 0 if it has none.
Bounds bounds_of(const std::string& operation, bool avx512);

// "<= 2.0 copies, >= 8 x peer"; "-" without bounds.
std::string describe(const Bounds& bounds);

bool reached(const Bounds& bounds, const Ratios& ratios);

}  // namespace haze::bench
