#include "tests/support/bytes_match.h"

#include <algorithm>
#include <cstring>
#include <iomanip>
#include <sstream>
#include <string>
#include <vector>

#include "tests/support/random.h"

namespace haze::test {
namespace {

std::string dump(const Bytes& bytes, size_t first, size_t last) {
  std::ostringstream text;
  for (size_t i = first; i < last; ++i)
    text << ' ' << std::setw(3) << static_cast<int>(bytes.data[i]);
  return text.str();
}

}  // namespace

::testing::AssertionResult bytes_match(const Bytes& actual, const Bytes& expected,
                                       const Arguments& arguments) {
  const bool same_size = actual.size == expected.size;
  if (same_size && (actual.size == 0 || std::memcmp(actual.data, expected.data, actual.size) == 0))
    return ::testing::AssertionSuccess();

  size_t row_bytes = 0;
  std::ostringstream text;
  text << "seed " << test_seed();
  for (const Argument& argument : arguments) {
    text << ", " << argument.name << " = " << std::setprecision(9) << argument.value;
    if (std::strcmp(argument.name, "row") == 0) row_bytes = static_cast<size_t>(argument.value);
  }
  if (!same_size) {
    text << ": " << actual.size << " bytes instead of " << expected.size;
    return ::testing::AssertionFailure() << text.str();
  }

  size_t first = 0;
  while (actual.data[first] == expected.data[first]) ++first;
  size_t differing = 0;
  for (size_t i = first; i < actual.size; ++i) differing += actual.data[i] != expected.data[i];
  text << ": " << differing << " of " << actual.size << " bytes differ, first at " << first;
  if (row_bytes != 0)
    text << " (row " << first / row_bytes << ", byte " << first % row_bytes << ")";
  const size_t from = first < 8 ? 0 : first - 8;
  const size_t to = std::min(first + 9, actual.size);
  text << "\n  bytes " << from << " ... " << to - 1 << "\n  actual  " << dump(actual, from, to)
       << "\n  expected" << dump(expected, from, to);
  return ::testing::AssertionFailure() << text.str();
}

::testing::AssertionResult all_bytes_are(const Bytes& actual, uint8_t value,
                                         const Arguments& arguments) {
  return bytes_match(actual, std::vector<uint8_t>(actual.size, value), arguments);
}

}  // namespace haze::test
