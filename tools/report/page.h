// A report as an HTML page that needs no other file and no network.
#pragma once

#include <string>

#include "report/data.h"

namespace dehaze {

std::string report_page(const ReportData& data);

}  // namespace dehaze
