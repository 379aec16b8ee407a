// Runs the haze removal for a report.
#pragma once

#include "console.h"
#include "report/data.h"
#include "report/options.h"

namespace dehaze {

ReportData collect_report(const ReportOptions& options, Console& console);

}  // namespace dehaze
