// The library's recovery tables of one slot: filled by the test, and compared.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "tests/reference/recovery_variants.h"
#include "tests/support/random.h"

namespace haze::test {

void put(int slot, const reference::SlotTables& tables);

// `table` is gTable1, gTable2 or gTable3.
::testing::AssertionResult holds(const unsigned* table, int slot,
                                 const std::vector<uint32_t>& entries);
::testing::AssertionResult slot_holds(int slot, const reference::SlotTables& tables);

// Entries that no recovery makes, with bits above the low byte and different in each table.
reference::SlotTables odd_tables(Random& random);

}  // namespace haze::test
