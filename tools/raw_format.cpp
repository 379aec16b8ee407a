#include "raw_format.h"

#include <algorithm>
#include <map>
#include <optional>
#include <sstream>

#include "errors.h"

namespace dehaze {
namespace {

constexpr const char* kFormatHelp =
    "; it has to be WIDTHxHEIGHT[:LAYOUT][:full|:limited][@RATE], as in 1280x720:nv21@30";
constexpr size_t kMostDigits = 6;

const std::map<std::string, RawLayout>& layouts() {
  static const std::map<std::string, RawLayout> kLayouts = {{"i420", RawLayout::kI420},
                                                            {"yv12", RawLayout::kYv12},
                                                            {"nv12", RawLayout::kNv12},
                                                            {"nv21", RawLayout::kNv21}};
  return kLayouts;
}

// A whole number above 0 in plain digits.
std::optional<int> positive_number(const std::string& text) {
  const bool is_number = !text.empty() && text.size() <= kMostDigits &&
                         text.find_first_not_of("0123456789") == std::string::npos;
  const int value = is_number ? std::stoi(text) : 0;
  return value > 0 ? std::optional<int>(value) : std::nullopt;
}

// Splits `text` at the first `mark`; the part behind it is removed from `text` and returned.
std::string cut_behind(std::string& text, char mark) {
  const size_t position = text.find(mark);
  if (position == std::string::npos) return "";
  std::string behind = text.substr(position + 1);
  text.erase(position);
  return behind;
}

bool read_size(std::string text, RawFormat& format) {
  const std::optional<int> height = positive_number(cut_behind(text, 'x'));
  const std::optional<int> width = positive_number(text);
  if (!width || !height) return false;
  format.width = *width;
  format.height = *height;
  return true;
}

// Such as "25", "29.97" or "30000/1001".
bool read_rate(std::string text, RawFormat& format) {
  if (text.find('/') != std::string::npos) {
    const std::optional<int> den = positive_number(cut_behind(text, '/'));
    const std::optional<int> num = positive_number(text);
    if (!num || !den) return false;
    format.rate_num = *num;
    format.rate_den = *den;
    return true;
  }
  int scale = 1;
  if (const size_t point = text.find('.'); point != std::string::npos) {
    for (size_t i = point + 1; i < text.size() && scale < 1000; ++i) scale *= 10;
    text.resize(std::min(text.size(), point + 4));
    text.erase(point, 1);
  }
  const std::optional<int> num = positive_number(text);
  if (!num) return false;
  format.rate_num = *num;
  format.rate_den = scale;
  return true;
}

bool read_word(const std::string& word, RawFormat& format) {
  if (word == "full" || word == "limited") {
    format.is_full_range = word == "full";
    return true;
  }
  const auto layout = layouts().find(word);
  if (layout == layouts().end()) return false;
  format.layout = layout->second;
  return true;
}

}  // namespace

RawFormat parse_raw_format(const std::string& text) {
  RawFormat format;
  std::string head = text;
  const bool has_rate = head.find('@') != std::string::npos;
  const std::string rate = cut_behind(head, '@');
  std::istringstream words(head + ':');  // so that the last word has an end as well
  std::string word;
  std::getline(words, word, ':');
  bool is_good = read_size(word, format) && (!has_rate || read_rate(rate, format));
  while (is_good && std::getline(words, word, ':')) is_good = read_word(word, format);
  if (!is_good) throw UsageError("--raw: \"" + text + "\" is not understood" + kFormatHelp);
  return format;
}

RawLayout parse_raw_layout(const std::string& text) {
  const auto layout = layouts().find(text);
  if (layout == layouts().end()) {
    throw UsageError("--raw-output: \"" + text + "\" is not one of i420, yv12, nv12, nv21");
  }
  return layout->second;
}

}  // namespace dehaze
