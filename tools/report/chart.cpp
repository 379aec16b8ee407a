#include "report/chart.h"

#include <algorithm>
#include <cmath>

#include "progress.h"
#include "report/html.h"

namespace dehaze {
namespace {

// Of the drawing, whatever size it gets on the page.
constexpr double kWidth = 1000;
constexpr double kHeight = 100;
constexpr size_t kMostPoints = 500;
constexpr size_t kBinValues = 4;  // values of a histogram that share a column

std::string svg_begin(const std::string& description) {
  return "<svg viewBox=\"0 0 " + number(kWidth, 0) + " " + number(kHeight, 0) +
         "\" preserveAspectRatio=\"none\" role=\"img\" aria-label=\"" + escaped(description) +
         "\"><path class=\"grid\" d=\"M0 25H1000M0 50H1000M0 75H1000\"/>";
}

std::string framed(const std::string& svg, const std::string& top, const std::string& bottom,
                   const std::vector<std::string>& across) {
  std::string html = "<div class=\"chart\"><div class=\"up\" aria-hidden=\"true\"><span>" + top +
                     "</span><span>" + bottom + "</span></div><div class=\"plot\">" + svg +
                     "</div><div class=\"across\" aria-hidden=\"true\">";
  for (const std::string& label : across) html += "<span>" + label + "</span>";
  return html + "</div></div>";
}

std::string point(double x, double y) { return number(x, 1) + " " + number(y, 1); }

struct Point {
  double x;
  double y;
};

// Neighbours become their mean where there are more than a screen can show.
std::vector<Point> thinned(const std::vector<double>& xs, const std::vector<double>& ys) {
  const size_t group = (xs.size() + kMostPoints - 1) / kMostPoints;
  std::vector<Point> points;
  for (size_t begin = 0; begin < xs.size(); begin += group) {
    const size_t end = std::min(begin + group, xs.size());
    Point sum{0, 0};
    for (size_t i = begin; i < end; ++i) {
      sum.x += xs[i];
      sum.y += ys[i];
    }
    const double count = static_cast<double>(end - begin);
    points.push_back({sum.x / count, sum.y / count});
  }
  return points;
}

std::string line_path(const std::vector<Point>& points, const LineChart& chart, double first,
                      double last) {
  const double length = last > first ? last - first : 1;
  std::string path;
  for (const Point& p : points) {
    const double share = (p.y - chart.low) / (chart.high - chart.low);
    path += (path.empty() ? "M" : "L") +
            point((p.x - first) / length * kWidth, (1 - std::clamp(share, 0.0, 1.0)) * kHeight);
  }
  return path;
}

std::vector<double> columns_of(const Histogram& histogram) {
  std::vector<double> columns;
  for (size_t value = 0; value < histogram.size(); value += kBinValues) {
    double sum = 0;
    for (size_t i = 0; i < kBinValues; ++i) sum += static_cast<double>(histogram[value + i]);
    columns.push_back(std::sqrt(sum));
  }
  return columns;
}

std::string histogram_path(const Histogram& histogram, bool is_area) {
  const std::vector<double> columns = columns_of(histogram);
  const double highest = *std::max_element(columns.begin(), columns.end());
  const double step = kWidth / static_cast<double>(columns.size());
  std::string path;
  for (size_t i = 0; i < columns.size(); ++i) {
    path += (path.empty() ? "M" : "L") +
            point((static_cast<double>(i) + 0.5) * step, (1 - columns[i] / highest) * kHeight);
  }
  const double end = kWidth - step / 2;
  return is_area ? path + "L" + point(end, kHeight) + "L" + point(step / 2, kHeight) + "Z" : path;
}

std::string path_element(const std::string& css_class, const std::string& path) {
  return "<path class=\"" + css_class + "\" d=\"" + path + "\"/>";
}

}  // namespace

std::string time_text(double seconds, bool has_times) {
  if (!has_times) return "frame " + number(seconds + 1, 0);
  if (seconds < 60) return number(seconds, 1) + " s";
  return duration_text(static_cast<int64_t>(seconds));
}

std::string draw_lines(const LineChart& chart, const std::vector<double>& times, bool has_times) {
  std::string svg = svg_begin(chart.description);
  std::string legend;
  const double first = times.front();
  const double last = times.back();
  for (const Series& series : chart.series) {
    const std::string css_class = "line " + series.css_class;
    svg += path_element(css_class, line_path(thinned(times, series.values), chart, first, last));
    legend += "<li class=\"" + series.css_class + "\">" + escaped(series.name) + "</li>";
  }
  // The script moves it to the frame that is shown.
  svg += "</svg><div class=\"now\" aria-hidden=\"true\"></div>";
  return "<figure class=\"lines\"><figcaption>" + escaped(chart.title) +
         (chart.series.size() > 1 ? "<ul class=\"legend\">" + legend + "</ul>" : "") +
         "</figcaption>" +
         framed(svg, number(chart.high, 0), number(chart.low, 0),
                {time_text(first, has_times), time_text((first + last) / 2, has_times),
                 time_text(last, has_times)}) +
         "</figure>";
}

std::string draw_histogram(const std::string& title, const Tones& tones) {
  const std::string figures = "mean " + number(tones.mean, 0) + ", contrast " +
                              number(tones.deviation, 0) + ", clipped " +
                              number(tones.clipped * 100, 1) + " %";
  const std::string svg = svg_begin("Histogram. " + title + ": " + figures) +
                          path_element("area", histogram_path(tones.luma, true)) +
                          path_element("line red", histogram_path(tones.red, false)) +
                          path_element("line green", histogram_path(tones.green, false)) +
                          path_element("line blue", histogram_path(tones.blue, false)) + "</svg>";
  return "<p class=\"which\">" + escaped(title) + "<small>" + figures + "</small></p>" +
         framed(svg, "", "", {"0", "128", "255"});
}

}  // namespace dehaze
