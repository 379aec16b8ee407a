// Byte for byte comparison that tells the arguments, the first difference and its surroundings.
#pragma once

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <initializer_list>

namespace haze::test {

// Any byte container: a vector, an array or one of the test buffers.
struct Bytes {
  Bytes(const uint8_t* first, size_t count) : data(first), size(count) {}
  template <class Container>
  Bytes(const Container& container) : data(container.data()), size(container.size()) {}

  const uint8_t* data;
  size_t size;
};

struct Argument {
  template <class T>
  Argument(const char* argument_name, T argument_value)
      : name(argument_name), value(static_cast<double>(argument_value)) {}

  const char* name;
  double value;
};

using Arguments = std::initializer_list<Argument>;

// An argument named "row" gives the bytes per row, by which the position is told.
::testing::AssertionResult bytes_match(const Bytes& actual, const Bytes& expected,
                                       const Arguments& arguments = {});

::testing::AssertionResult all_bytes_are(const Bytes& actual, uint8_t value,
                                         const Arguments& arguments = {});

}  // namespace haze::test
