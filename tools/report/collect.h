// Runs the haze removal for a report.
#ifndef TOOLS_REPORT_COLLECT_H
#define TOOLS_REPORT_COLLECT_H

#include "console.h"
#include "report/data.h"
#include "report/options.h"

namespace dehaze {

ReportData collect_report(const ReportOptions& options, Console& console);

}  // namespace dehaze

#endif  // TOOLS_REPORT_COLLECT_H
