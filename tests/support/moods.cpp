#include "tests/support/moods.h"

#include <algorithm>
#include <cstddef>

namespace haze::test {
namespace {

uint8_t clamp_to_byte(int value) { return static_cast<uint8_t>(std::min(std::max(value, 0), 255)); }

void fill_blocks(Random& random, uint8_t* image, int width, int height) {
  const int block = random.between(2, 24);
  const uint64_t pattern = random.next();
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int cell = (x / block) * 5 + (y / block) * 11;
      const int base = (pattern >> (cell % 64)) & 1 ? 250 : 5;
      image[y * width + x] = clamp_to_byte(base + random.between(-12, 12));
    }
}

void fill_gradient(Random& random, uint8_t* image, int width, int height) {
  const int slope_x = random.between(-255, 255);
  const int slope_y = random.between(-255, 255);
  const int start = random.between(0, 255);
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x)
      image[y * width + x] = clamp_to_byte(start + slope_x * x / width + slope_y * y / height);
}

}  // namespace

void fill_image(Random& random, Mood mood, uint8_t* image, int width, int height) {
  const int count = width * height;
  switch (mood) {
    case Mood::kNearZero:
      for (int i = 0; i < count; ++i) image[i] = static_cast<uint8_t>(random.between(0, 3));
      break;
    case Mood::kNearMaximum:
      for (int i = 0; i < count; ++i) image[i] = static_cast<uint8_t>(random.between(252, 255));
      break;
    case Mood::kNoise:
      for (int i = 0; i < count; ++i) image[i] = random.byte();
      break;
    case Mood::kBlocks:
      fill_blocks(random, image, width, height);
      break;
    case Mood::kGradient:
      fill_gradient(random, image, width, height);
      break;
    case Mood::kSparks:
      for (int i = 0; i < count; ++i) {
        const bool spark = random.between(0, 23) == 0;
        image[i] = static_cast<uint8_t>(spark ? random.between(225, 255) : random.between(0, 12));
      }
      break;
  }
}

std::vector<uint8_t> make_image(Random& random, Mood mood, int width, int height) {
  std::vector<uint8_t> image(static_cast<size_t>(width) * static_cast<size_t>(height));
  fill_image(random, mood, image.data(), width, height);
  return image;
}

std::vector<uint8_t> make_frame(Random& random, Mood luma, Colours colours, int width, int height) {
  std::vector<uint8_t> frame = make_image(random, luma, width, height);
  std::vector<uint8_t> chroma = make_image(
      random, colours == Colours::kWild ? random.one_of(kMoods) : Mood::kNoise, width, height / 2);
  if (colours == Colours::kMuted)
    for (uint8_t& sample : chroma) sample = static_cast<uint8_t>(122 + sample % 13);
  frame.insert(frame.end(), chroma.begin(), chroma.end());
  return frame;
}

std::vector<uint8_t> make_hazy_frame(Random& random, int width, int height) {
  std::vector<uint8_t> frame(static_cast<size_t>(width * height * 3 / 2));
  const int veil = random.between(190, 235);
  const int tint = random.between(-6, 6);
  uint8_t* out = frame.data();
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int scene = ((x / 23) * 37 + (y / 17) * 59) % 160;
      // Clear at the bottom, nearly all veil at the top.
      const int clear = 30 + 70 * y / height;
      const int hazy = (scene * clear + veil * (100 - clear)) / 100;
      *out++ = clamp_to_byte(hazy + random.between(-4, 4));
    }
  for (int y = 0; y < height / 2; ++y)
    for (int x = 0; x < width; ++x) {
      const int colour = ((x / 31) * 13 + (y / 9) * 29) % 41 - 20;
      *out++ = clamp_to_byte(128 + tint + colour * y / height + random.between(-2, 2));
    }
  return frame;
}

}  // namespace haze::test
