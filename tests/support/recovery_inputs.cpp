#include "tests/support/recovery_inputs.h"

#include <cstddef>
#include <limits>

#include "tests/support/float_planes.h"

namespace haze::test {
namespace {

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNotANumber = std::numeric_limits<float>::quiet_NaN();
// Quotients and products with bytes stay normal numbers.
constexpr float kOutside[] = {0.0f,    -0.0f,   -1.0f,  2.0f,      -0.25f,     1.0e-30f,
                              1.0e30f, -1.0e9f, 3.0e9f, kInfinity, -kInfinity, kNotANumber};

float near_index_step(Random& random) {
  const float step = static_cast<float>(random.between(1, 256));
  const float divisor = random.between(0, 1) == 0 ? 255.0f : 256.0f;
  return ulps_from(step / divisor, random.between(-2, 2));
}

// Completes `sum` to a value whose product with `scale` is close to a whole number.
float completion(Random& random, float sum, float scale) {
  const int steps = static_cast<int>(sum * scale) + random.between(1, static_cast<int>(scale) / 2);
  const float rest = static_cast<float>(steps) / scale - sum;
  return rest > 0.001f ? ulps_from(rest, random.between(-1, 1)) : 0.5f;
}

// Row by row, each sample completes a sum with neighbours to its left and above.
std::vector<float> sum_steps(Random& random, int blocks_x, int blocks_y) {
  std::vector<float> map;
  const auto sample = [&](int x, int y) { return map[static_cast<size_t>(y * blocks_x + x)]; };
  for (int y = 0; y < blocks_y; ++y)
    for (int x = 0; x < blocks_x; ++x) {
      const int choice = random.between(0, 3);
      float value = float_between(random, 0.05f, 0.6f);
      if (choice <= 1 && x > 0 && y > 0)
        value =
            completion(random, sample(x - 1, y - 1) + sample(x, y - 1) + sample(x - 1, y), 64.0f);
      else if (choice == 2 && x > 0)
        value = completion(random, sample(x - 1, y), 128.0f);
      else if (y > 0)
        value = completion(random, sample(x, y - 1), 128.0f);
      map.push_back(value);
    }
  return map;
}

}  // namespace

Light grey_light(int value) {
  const uint8_t byte = static_cast<uint8_t>(value);
  return {byte, byte, byte};
}

Light random_light(Random& random) {
  if (random.between(0, 3) == 0) return grey_light(random.byte());
  return {random.byte(), random.byte(), random.byte()};
}

std::vector<uint8_t> random_codes(Random& random, int width, int height, int first, int last) {
  std::vector<uint8_t> codes(static_cast<size_t>(width / 2 * (height / 2)));
  for (uint8_t& code : codes) code = static_cast<uint8_t>(random.between(first, last));
  return codes;
}

std::vector<float> make_transmissions(Random& random, TransmissionMood mood, int width,
                                      int height) {
  if (mood == TransmissionMood::kSumSteps) return sum_steps(random, width / 2, height / 2);
  const float flat = float_between(random, 0.05f, 1.0f);
  std::vector<float> map(static_cast<size_t>(width / 2 * (height / 2)));
  for (float& t : map) switch (mood) {
      case TransmissionMood::kUsual:
        t = float_between(random, 0.1f, 1.0f);
        break;
      case TransmissionMood::kDense:
        t = float_between(random, 1.0f / 256.0f, 0.1f);
        break;
      case TransmissionMood::kFlat:
        t = flat;
        break;
      case TransmissionMood::kIndexSteps:
        t = near_index_step(random);
        break;
      case TransmissionMood::kSumSteps:
      case TransmissionMood::kOutside:
        t = random.between(0, 2) == 0 ? random.one_of(kOutside) : float_between(random, 0.1f, 1.0f);
        break;
    }
  return map;
}

}  // namespace haze::test
