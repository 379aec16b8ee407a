// A report as an HTML page that needs no other file and no network.
#ifndef TOOLS_REPORT_PAGE_H
#define TOOLS_REPORT_PAGE_H

#include <string>

#include "report/data.h"

namespace dehaze {

std::string report_page(const ReportData& data);

}  // namespace dehaze

#endif  // TOOLS_REPORT_PAGE_H
