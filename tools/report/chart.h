// Charts as inline SVG. The drawing stretches with the page; the labels are text beside it, so that
// they keep their size on a phone.
#pragma once

#include <string>
#include <vector>

#include "report/data.h"

namespace dehaze {

struct Series {
  std::string name;       // for the legend
  std::string css_class;  // of the line
  std::vector<double> values;
};

struct LineChart {
  std::string title;
  std::string description;  // for those who do not see it
  std::vector<Series> series;
  double low;
  double high;
};

// times: not falling, one per value.
std::string draw_lines(const LineChart& chart, const std::vector<double>& times, bool has_times);

// Heights are square roots of the counts, so that small shares show beside large flat areas.
std::string draw_histogram(const std::string& title, const Tones& tones);

// "1.5 s", "2:03", or "frame 12" where there are no times.
std::string time_text(double seconds, bool has_times);

}  // namespace dehaze
