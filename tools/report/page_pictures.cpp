#include "report/page_pictures.h"

#include <algorithm>
#include <cmath>

#include "report/chart.h"
#include "report/html.h"

namespace dehaze {
namespace {

// Frames to choose from, side by side.
constexpr size_t kMostAcrossPhone = 4;

std::string image(const Jpeg& jpeg, const std::string& text) {
  return "<img width=\"" + std::to_string(jpeg.width) + "\" height=\"" +
         std::to_string(jpeg.height) + "\" alt=\"" + escaped(text) +
         "\" draggable=\"false\" src=\"" + jpeg_uri(jpeg.bytes) + "\">";
}

// What belongs to one view. The script shows another one.
std::string of_view(const std::string& tag, size_t index, const std::string& css_class) {
  return "<" + tag + " class=\"" + css_class + "\" data-view=\"" + std::to_string(index) + "\"" +
         (index > 0 ? " hidden>" : ">");
}

std::string side(const std::string& css_class, const Jpeg& jpeg, const std::string& text,
                 const std::string& tag) {
  return "<div class=\"side " + css_class + "\">" + image(jpeg, text) +
         "<span class=\"tag\" aria-hidden=\"true\">" + tag + "</span></div>";
}

std::string captioned(const std::string& css_class, const std::string& caption,
                      const std::string& content) {
  return "<figure class=\"" + css_class + "\"><figcaption>" + caption + "</figcaption>" + content +
         "</figure>";
}

std::string findings_of(const View& view) {
  std::string html = captioned(
      "picture", "Transmission<small>mean " + number(view.mean_transmission, 2) + "</small>",
      image(view.map, "Transmission map") +
          "<p class=\"scale\"><span>0: only haze</span><i></i><span>1: no haze</span></p>");
  if (view.clear) {
    html += captioned("picture", "Clear reference", image(*view.clear, "Clear reference"));
  }
  return html + captioned("histograms", "Histograms",
                          draw_histogram("Before", view.tones_before) +
                              draw_histogram("After", view.tones_after));
}

// Rounded outwards, so that what hardly changes looks like it.
void fit_range(LineChart& chart) {
  constexpr double kStep = 10;
  double low = 255;
  double high = 0;
  for (const Series& series : chart.series) {
    const auto range = std::minmax_element(series.values.begin(), series.values.end());
    low = std::min(low, *range.first);
    high = std::max(high, *range.second);
  }
  chart.low = std::max(0.0, std::floor(low / kStep - 1) * kStep);
  chart.high = std::min(260.0, std::ceil(high / kStep + 1) * kStep);
}

template <typename Value>
std::vector<double> values_of(const std::vector<Moment>& moments, Value value) {
  std::vector<double> values;
  values.reserve(moments.size());
  for (const Moment& moment : moments) values.push_back(value(moment));
  return values;
}

std::string ends_text(const Series& series) {
  return series.name + " " + number(series.values.front(), 0) + " at the start, " +
         number(series.values.back(), 0) + " at the end";
}

LineChart described(LineChart chart) {
  chart.description = chart.title;
  for (const Series& series : chart.series) chart.description += "; " + ends_text(series);
  return chart;
}

LineChart light_chart(const std::vector<Moment>& moments) {
  const auto red = [](const Moment& m) { return m.findings.light_red; };
  const auto green = [](const Moment& m) { return m.findings.light_green; };
  const auto blue = [](const Moment& m) { return m.findings.light_blue; };
  LineChart chart{"Light of the haze", "", {}, 0, 255};
  chart.series = {{"red", "red", values_of(moments, red)},
                  {"green", "green", values_of(moments, green)},
                  {"blue", "blue", values_of(moments, blue)}};
  fit_range(chart);
  return described(chart);
}

LineChart strength_chart(const std::vector<Moment>& moments) {
  const auto strength = [](const Moment& m) { return m.findings.strength; };
  return described({"Strength in use",
                    "",
                    {{"strength", "accent", values_of(moments, strength)}},
                    0,
                    kMaxStrength});
}

LineChart brightness_chart(const std::vector<Moment>& moments) {
  const auto before = [](const Moment& m) { return m.luma_before; };
  const auto after = [](const Moment& m) { return m.luma_after; };
  LineChart chart{"Brightness level (mean luma)", "", {}, 0, 255};
  chart.series = {{"before", "plain", values_of(moments, before)},
                  {"after", "accent", values_of(moments, after)}};
  fit_range(chart);
  return described(chart);
}

}  // namespace

std::string comparison(const ReportData& data) {
  std::string html;
  for (size_t i = 0; i < data.views.size(); ++i) {
    const View& view = data.views[i];
    html += of_view("figure", i, "compare") +
            "<div class=\"stage\" style=\"--w:" + std::to_string(view.after.width) +
            ";--h:" + std::to_string(view.after.height) + "\">" +
            side("after", view.after, data.input_name + " without haze", "After") +
            side("before", view.before, data.input_name + " as it was", "Before") +
            "<input type=\"range\" min=\"0\" max=\"100\" step=\"1\" value=\"50\" "
            "aria-label=\"Divider between before and after\" aria-valuetext=\"50 % before\">"
            "<div class=\"handle\" aria-hidden=\"true\"></div></div></figure>\n";
  }
  return html + "<p class=\"hint\">Drag the divider, or use the arrow keys.</p>\n";
}

std::string frame_choice(const ReportData& data) {
  const size_t count = data.views.size();
  if (count < 2) return "";
  std::string html =
      "<fieldset class=\"frames\" style=\"--wide:" + std::to_string(count) +
      ";--narrow:" + std::to_string(count > kMostAcrossPhone ? (count + 1) / 2 : count) +
      "\"><legend>Frame</legend>\n";
  const double first = data.moments.front().seconds;
  const double length = data.moments.back().seconds - first;
  for (size_t i = 0; i < count; ++i) {
    const View& view = data.views[i];
    const double at = length > 0 ? (view.seconds - first) / length * 100 : 0;
    const std::string index = std::to_string(i);
    html += "<label><input type=\"radio\" name=\"view\" value=\"" + index + "\" data-at=\"" +
            number(at, 2) + "\"" + (i == 0 ? " checked" : "") + "><img alt=\"\">" + "<span>" +
            time_text(view.seconds, data.has_times) + "</span></label>\n";
  }
  return html + "</fieldset>\n";
}

std::string findings(const ReportData& data) {
  std::string html;
  for (size_t i = 0; i < data.views.size(); ++i) {
    html += of_view("div", i, "grid") + findings_of(data.views[i]) + "</div>\n";
  }
  return html +
         "<p class=\"remark\">Histograms: luma as an area, red, green and blue as lines; heights "
         "are square roots of the counts. Contrast is the deviation of luma; clipped are pixels "
         "with a channel at 0 or 255.</p>\n";
}

std::string over_time(const ReportData& data) {
  if (data.moments.size() < 2) return "";
  const std::vector<double> times =
      values_of(data.moments, [](const Moment& m) { return m.seconds; });
  std::string html = "<div class=\"grid\">";
  for (const LineChart& chart :
       {light_chart(data.moments), strength_chart(data.moments), brightness_chart(data.moments)}) {
    html += draw_lines(chart, times, data.has_times);
  }
  return html + "</div>\n";
}

}  // namespace dehaze
