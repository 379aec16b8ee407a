#include "tests/surface/call.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace haze::test {
namespace {

bool is_not_a_number(const uint8_t* bytes) {
  float value;
  std::memcpy(&value, bytes, sizeof value);
  return std::isnan(value);
}

}  // namespace

void* Call::add(std::vector<uint8_t> content, std::vector<uint8_t> wanted, bool floats) {
  auto own = std::make_unique<GuardedBytes>(content.size(), placement_);
  uint8_t* const bytes = own->data();
  std::copy(content.begin(), content.end(), bytes);
  memories_.push_back({std::move(own), bytes, std::move(content), std::move(wanted), floats});
  return bytes;
}

void Call::add_global(void* memory, std::vector<uint8_t> content, std::vector<uint8_t> wanted) {
  memories_.push_back(
      {nullptr, static_cast<uint8_t*>(memory), std::move(content), std::move(wanted), false});
}

void Call::prepare() {
  for (const Memory& memory : memories_)
    if (memory.own == nullptr)
      std::copy(memory.content.begin(), memory.content.end(), memory.bytes);
  if (fill_globals_) fill_globals_();
}

// The size where there is none. The bits of what is not a number depend on the target.
size_t Call::first_difference(const Memory& memory) {
  const size_t step = memory.floats ? sizeof(float) : 1;
  for (size_t i = 0; i < memory.wanted.size(); i += step) {
    if (std::memcmp(memory.bytes + i, memory.wanted.data() + i, step) == 0) continue;
    const bool both_are_none = memory.floats && is_not_a_number(memory.bytes + i) &&
                               is_not_a_number(memory.wanted.data() + i);
    if (!both_are_none) return i;
  }
  return memory.wanted.size();
}

std::string Call::difference() const {
  if (result_ != wanted_result_)
    return "returned " + std::to_string(result_) + " instead of " + std::to_string(wanted_result_);
  for (size_t i = 0; i < memories_.size(); ++i) {
    const Memory& memory = memories_[i];
    const std::string name = "buffer " + std::to_string(i);
    if (memory.own != nullptr && !memory.own->intact()) return name + ": written outside";
    const size_t at = first_difference(memory);
    if (at != memory.wanted.size())
      return name + " of " + std::to_string(memory.wanted.size()) + " bytes: byte " +
             std::to_string(at) + " is " + std::to_string(memory.bytes[at]) + " instead of " +
             std::to_string(memory.wanted[at]);
  }
  return {};
}

void Call::add_to(Fnv1a& digest) const {
  constexpr uint8_t kNotANumber[sizeof(float)] = {};
  for (const Memory& memory : memories_) {
    const size_t step = memory.floats ? sizeof(float) : 1;
    for (size_t i = 0; i < memory.wanted.size(); i += step) {
      const uint8_t* const at = memory.bytes + i;
      digest.add(memory.floats && is_not_a_number(at) ? kNotANumber : at, step);
    }
  }
  for (int shift = 0; shift < 32; shift += 8) {
    const uint8_t byte = static_cast<uint8_t>(static_cast<uint32_t>(result_) >> shift);
    digest.add(&byte, 1);
  }
}

bool Call::untouched() const {
  return std::all_of(memories_.begin(), memories_.end(), [](const Memory& memory) {
    return (memory.own == nullptr || memory.own->intact()) &&
           std::equal(memory.content.begin(), memory.content.end(), memory.bytes);
  });
}

}  // namespace haze::test
