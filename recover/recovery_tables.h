// Recovered bytes of every sample for every transmission code, for one atmospheric light.
#pragma once

#include <stdint.h>

#include "recover/light_anchor.h"

namespace haze::recover {

// Transmissions up to (159 + 40) / 200; the codes of a transmission map end at 158.
inline constexpr int kTableCodes = 160;

struct CodeTable {
  uint8_t luma[256];  // recovered, then brightened by the tone curve
  uint8_t v[256];
  uint8_t u[256];
};

struct RecoveryTables {
  CodeTable codes[kTableCodes];
};

void build_code_table(LightAnchor anchor, int code, CodeTable& table);

void build_tables(LightAnchor anchor, RecoveryTables& tables);

// Tables that are kept as long as the light stays the same, as it does between an estimate frame
// and the reuse frame after it.
class KeptTables {
 public:
  const RecoveryTables& for_anchor(LightAnchor anchor) {
    if (!built_ || !(anchor == anchor_)) {
      build_tables(anchor, tables_);
      anchor_ = anchor;
      built_ = true;
    }
    return tables_;
  }

 private:
  RecoveryTables tables_;
  LightAnchor anchor_;
  bool built_;
};

}  // namespace haze::recover
