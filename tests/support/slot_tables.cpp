#include "tests/support/slot_tables.h"

#include <algorithm>

#include "haze_preview.h"

namespace haze::test {
namespace {

using reference::kTableEntries;
using reference::SlotTables;

static_assert(sizeof gTable1 == 8u * kTableEntries * 4u);
static_assert(sizeof gTable2 == sizeof gTable1);
static_assert(sizeof gTable3 == sizeof gTable1);

void put(unsigned* table, int slot, const std::vector<uint32_t>& entries) {
  std::copy(entries.begin(), entries.end(), table + slot * kTableEntries);
}

}  // namespace

void put(int slot, const SlotTables& tables) {
  put(gTable1, slot, tables.luma);
  put(gTable2, slot, tables.v);
  put(gTable3, slot, tables.u);
}

::testing::AssertionResult holds(const unsigned* table, int slot,
                                 const std::vector<uint32_t>& entries) {
  const auto difference =
      std::mismatch(entries.begin(), entries.end(), table + slot * kTableEntries);
  if (difference.first == entries.end()) return ::testing::AssertionSuccess();
  const auto i = difference.first - entries.begin();
  return ::testing::AssertionFailure()
         << "slot " << slot << ", code " << i / 256 << ", value " << i % 256 << ": "
         << *difference.second << " instead of " << *difference.first;
}

::testing::AssertionResult slot_holds(int slot, const SlotTables& tables) {
  if (auto result = holds(gTable1, slot, tables.luma); !result) return result << " (luma)";
  if (auto result = holds(gTable2, slot, tables.v); !result) return result << " (V)";
  return holds(gTable3, slot, tables.u) << " (U)";
}

SlotTables odd_tables(Random& random) {
  SlotTables tables;
  for (auto* table : {&tables.luma, &tables.v, &tables.u})
    for (int i = 0; i < kTableEntries; ++i) table->push_back(static_cast<uint32_t>(random.next()));
  return tables;
}

}  // namespace haze::test
