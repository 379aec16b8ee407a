// The parts of a page that are figures and words.
#pragma once

#include <string>

#include "report/data.h"

namespace dehaze {

// The few figures that most people look for.
std::string facts(const ReportData& data);

// Empty without a reference.
std::string quality(const ReportData& data);

std::string timing(const ReportData& data);
std::string settings(const ReportData& data);

// Empty if there are none.
std::string notes(const ReportData& data);

}  // namespace dehaze
