#include "recover/recovery_tables.h"

#include "haze_preview.h"
#include "recover/recovery_kernels.h"

namespace haze::recover {

void build_code_table(LightAnchor anchor, int code, CodeTable& table) {
  const float factor = recovery_factor(code);
  recover_all(anchor.y, factor, table.luma);
  recover_all(anchor.v, factor, table.v);
  recover_all(anchor.u, factor, table.u);
  for (uint8_t& luma : table.luma) luma = LutTablePreview[luma];
}

void build_tables(LightAnchor anchor, RecoveryTables& tables) {
  for (int code = 0; code < kTableCodes; ++code) build_code_table(anchor, code, tables.codes[code]);
}

}  // namespace haze::recover
