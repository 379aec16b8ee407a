#include "photo/table_recovery.h"

#include <algorithm>
#include <cmath>

#include "haze_preview.h"

namespace dehaze {
namespace {

// The photo engine is the only user of the slot tables.
constexpr int kSlot = 0;
constexpr int kCodes = 160;
constexpr uint8_t kUntouched = kCodes;  // the library leaves such blocks alone

// Codes are evenly spaced in log t, from this transmission to 1: neighbours differ by 1.8 % of the
// contrast against the light, less than two values even for black against white.
constexpr double kFirstTransmission = 0.06;

// Shares of haze in steps of 1 / kShareSteps.
constexpr int kShareSteps = 2048;

uint8_t code_of(double transmission) {
  const double position = 1 - std::log(transmission) / std::log(kFirstTransmission);
  return static_cast<uint8_t>(std::lround(std::clamp(position, 0.0, 1.0) * kUntouched));
}

void fill_table(unsigned* table, double anchor, double transmission) {
  for (int value = 0; value < 256; ++value) {
    const double recovered = anchor + (value - anchor) / transmission;
    table[value] = static_cast<unsigned>(std::lround(std::clamp(recovered, 0.0, 255.0)));
  }
}

}  // namespace

std::vector<uint8_t> recovery_codes(const Plane& share, const Removal& removal) {
  std::array<uint8_t, kShareSteps + 1> code_of_step;
  for (int step = 0; step <= kShareSteps; ++step) {
    code_of_step[static_cast<size_t>(step)] =
        code_of(removal.transmission(static_cast<double>(step) / kShareSteps));
  }
  std::vector<uint8_t> codes(share.values.size());
  std::transform(share.values.begin(), share.values.end(), codes.begin(), [&](float value) {
    // NOLINTNEXTLINE(bugprone-incorrect-roundings): lround is a call for each pixel
    return code_of_step[static_cast<size_t>(std::clamp(value, 0.0F, 1.0F) * kShareSteps + 0.5F)];
  });
  return codes;
}

float transmission_of_code(uint8_t code) {
  const double position = static_cast<double>(code) / kUntouched;
  return static_cast<float>(std::pow(kFirstTransmission, 1 - position));
}

void recover(Nv21Frame& frame, std::vector<uint8_t>& codes, const std::array<double, 3>& light) {
  // The light as luma and chroma, BT.601: the model holds for them as it does for the colours.
  const double luma = 0.114 * light[0] + 0.587 * light[1] + 0.299 * light[2];
  const double u = 128 + 0.564 * (light[0] - luma);
  const double v = 128 + 0.713 * (light[2] - luma);
  for (int code = 0; code < kCodes; ++code) {
    const double transmission = transmission_of_code(static_cast<uint8_t>(code));
    const ptrdiff_t row = (ptrdiff_t{kSlot} * kCodes + code) * 256;
    fill_table(gTable1 + row, luma, transmission);
    fill_table(gTable2 + row, v, transmission);
    fill_table(gTable3 + row, u, transmission);
  }
  CalculateRemovePreview(frame.bytes.data(), codes.data(), frame.width, frame.height, kSlot);
}

}  // namespace dehaze
