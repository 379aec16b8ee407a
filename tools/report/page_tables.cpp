#include "report/page_tables.h"

#include <algorithm>
#include <numeric>

#include "haze_preview.h"
#include "report/html.h"

namespace dehaze {
namespace {

template <typename Value>
double mean_of(const std::vector<View>& views, Value value) {
  double sum = 0;
  for (const View& view : views) sum += value(view);
  return sum / static_cast<double>(views.size());
}

std::string fact(const std::string& name, const std::string& value, const std::string& detail) {
  return "<div><dt>" + name + "</dt><dd>" + value + "<small>" + detail + "</small></dd></div>\n";
}

std::string change(double before, double after, int decimals) {
  return number(before, decimals) + " \u2192 " + number(after, decimals);
}

std::string strength_fact(const ReportData& data) {
  if (data.options.level) {
    return fact("Level", std::to_string(*data.options.level),
                "of " + std::to_string(kMaxLevel) + ", as asked for");
  }
  return fact("Strength", number(data.run.findings.strength, 0),
              "of " + std::to_string(kMaxStrength) +
                  (data.options.strength ? ", as asked for" : ", chosen automatically"));
}

std::string light_fact(const HazeFindings& findings) {
  const std::string red = number(findings.light_red, 0);
  const std::string green = number(findings.light_green, 0);
  const std::string blue = number(findings.light_blue, 0);
  return fact("Light of the haze",
              "<i class=\"swatch\" style=\"background:rgb(" + red + "," + green + "," + blue +
                  ")\"></i>" + red + " " + green + " " + blue,
              "red, green, blue");
}

double median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  const size_t middle = values.size() / 2;
  return values.size() % 2 == 1 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

double mean(const std::vector<double>& values) {
  return std::accumulate(values.begin(), values.end(), 0.0) / static_cast<double>(values.size());
}

// Three significant digits, roughly.
std::string milliseconds(double ms) { return number(ms, ms < 1 ? 3 : ms < 10 ? 2 : ms < 100); }

double mean_time(const FrameTimes& times) {
  std::vector<double> all = times.estimate_ms;
  all.insert(all.end(), times.reuse_ms.begin(), times.reuse_ms.end());
  return mean(all);
}

std::string cell(const std::string& text) { return "<td>" + text + "</td>"; }

std::string table(const std::vector<std::string>& columns, const std::string& rows) {
  std::string html = "<div class=\"table\"><table><thead><tr>";
  for (const std::string& column : columns) html += "<th scope=\"col\">" + column + "</th>";
  return html + "</tr></thead><tbody>\n" + rows + "</tbody></table></div>\n";
}

std::string row(const std::string& name, const std::string& cells) {
  return "<tr><th scope=\"row\">" + name + "</th>" + cells + "</tr>\n";
}

std::string timing_row(const std::string& name, const std::vector<double>& ms) {
  if (ms.empty()) return "";
  return row(name, cell(std::to_string(ms.size())) + cell(milliseconds(median(ms))) +
                       cell(milliseconds(*std::min_element(ms.begin(), ms.end()))) +
                       cell(milliseconds(*std::max_element(ms.begin(), ms.end()))));
}

struct Metric {
  const char* name;
  double Quality::*value;
  int decimals;
};

constexpr Metric kMetrics[] = {{"PSNR, dB", &Quality::psnr, 2},
                               {"SSIM", &Quality::ssim, 4},
                               {"CIEDE2000", &Quality::ciede2000, 2},
                               {"Hue shift, \u00B0", &Quality::hue_shift, 2}};

bool has_quality(const ReportData& data) {
  return std::all_of(data.views.begin(), data.views.end(), [](const View& view) {
    return view.quality_before.has_value() && view.quality_after.has_value();
  });
}

double mean_quality(const ReportData& data, std::optional<Quality> View::*when,
                    double Quality::*value) {
  return mean_of(data.views, [=](const View& view) { return *(view.*when).*value; });
}

std::string quality_row(const ReportData& data, const Metric& metric) {
  const double before = mean_quality(data, &View::quality_before, metric.value);
  const double after = mean_quality(data, &View::quality_after, metric.value);
  const double change = before == after ? 0 : after - before;  // both may be infinite
  return row(metric.name, cell(number(before, metric.decimals)) +
                              cell(number(after, metric.decimals)) +
                              cell((change > 0 ? "+" : "") + number(change, metric.decimals)));
}

std::string quality_fact(const ReportData& data) {
  if (!has_quality(data)) return "";
  return fact("PSNR",
              change(mean_quality(data, &View::quality_before, &Quality::psnr),
                     mean_quality(data, &View::quality_after, &Quality::psnr), 1),
              "dB, against the clear reference");
}

std::string size_text(int width, int height) {
  return std::to_string(width) + " x " + std::to_string(height);
}

std::string setting(const std::string& name, const std::string& value) {
  return "<div><dt>" + name + "</dt><dd>" + escaped(value) + "</dd></div>\n";
}

std::string engine_text(const ReportData& data) {
  const std::string name = data.engine == EngineKind::kPhoto ? "photo" : "preview";
  return name + (data.options.engine == EngineKind::kByInput ? ", chosen for the input" : "");
}

std::string strength_text(const EngineOptions& options) {
  if (options.level) return "level " + std::to_string(*options.level);
  return options.strength ? std::to_string(*options.strength) : "automatic";
}

}  // namespace

std::string facts(const ReportData& data) {
  const double contrast_before =
      mean_of(data.views, [](const View& view) { return view.tones_before.deviation; });
  const double contrast_after =
      mean_of(data.views, [](const View& view) { return view.tones_after.deviation; });
  const double transmission =
      mean_of(data.views, [](const View& view) { return view.mean_transmission; });
  return "<dl class=\"facts\">\n" + quality_fact(data) + strength_fact(data) +
         light_fact(data.run.findings) +
         fact("Transmission", number(transmission, 2), "on average; 1 is no haze") +
         fact("Contrast", change(contrast_before, contrast_after, 0), "deviation of luma") +
         fact("Time", milliseconds(mean_time(data.run.times)) + " ms",
              data.is_picture ? "in the library" : "per frame, in the library") +
         "</dl>\n";
}

std::string quality(const ReportData& data) {
  if (data.reference_name.empty()) return "";
  if (!has_quality(data)) return "<p>The pictures are too small to be compared.</p>\n";
  std::string rows;
  for (const Metric& metric : kMetrics) rows += quality_row(data, metric);
  const size_t count = data.views.size();
  return table({"", "Before", "After", "Change"}, rows) + "<p class=\"remark\">Against " +
         escaped(data.reference_name) +
         (count > 1 ? ", mean of the " + std::to_string(count) + " frames that are shown" : "") +
         ". PSNR of all RGB samples and mean SSIM of luma: more is closer. Mean CIEDE2000 colour "
         "difference and mean shift of the hue of coloured pixels: less is closer.</p>\n";
}

std::string timing(const ReportData& data) {
  const FrameTimes& times = data.run.times;
  if (data.is_picture) {
    return "<p>" + milliseconds(mean_time(times)) +
           " ms for the haze removal alone, without decoding and conversion.</p>\n";
  }
  const bool has_kinds = !times.reuse_ms.empty();
  return table({"Milliseconds", "Frames", "Median", "Least", "Most"},
               timing_row(has_kinds ? "Estimate" : "Every frame", times.estimate_ms) +
                   timing_row("Reuse", times.reuse_ms)) +
         "<p class=\"remark\">Haze removal alone, without decoding and conversion" +
         (has_kinds ? "; every second frame reuses the estimate of the one before" : "") +
         ".</p>\n";
}

std::string settings(const ReportData& data) {
  const FrameSize& size = data.size;
  std::string html = setting("Input", data.input_name) +
                     setting("Size", size_text(size.source_width, size.source_height));
  if (size.is_scaled()) {
    html += setting("Scaled down to", size_text(size.visible_width, size.visible_height));
  }
  if (!data.is_picture) html += setting("Frames", std::to_string(data.frames));
  if (!data.reference_name.empty()) html += setting("Reference", data.reference_name);
  return "<dl class=\"settings\">\n" + html + setting("Engine", engine_text(data)) +
         setting("Strength", strength_text(data.options)) +
         setting("Version", HAZE_PREVIEW_VERSION_STRING) + "</dl>\n";
}

std::string notes(const ReportData& data) {
  if (data.notes.empty()) return "";
  std::string html = "<ul>\n";
  for (const std::string& note : data.notes) html += "<li>" + escaped(note) + "</li>\n";
  return html + "</ul>\n";
}

}  // namespace dehaze
