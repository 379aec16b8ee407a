// The parts of a page that show pictures and charts.
#pragma once

#include <string>

#include "report/data.h"

namespace dehaze {

// Before and after, with a divider to move; one for each view, all but the first hidden.
std::string comparison(const ReportData& data);

// Which view is shown; empty if there is but one.
std::string frame_choice(const ReportData& data);

// Transmission map, histograms and reference of each view.
std::string findings(const ReportData& data);

// Light, strength and brightness; empty for a picture.
std::string over_time(const ReportData& data);

}  // namespace dehaze
