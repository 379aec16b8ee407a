#include "json.h"

#include <cstdio>

namespace dehaze {
namespace {

constexpr const char* kReplacement = "\xEF\xBF\xBD";  // U+FFFD

// Bytes of the UTF-8 character that begins at text[i], 0 if none does. Overlong forms, surrogates
// and what lies beyond U+10FFFF are no characters (RFC 3629).
size_t utf8_length(const std::string& text, size_t i) {
  const auto byte = [&](size_t k) { return static_cast<unsigned char>(text[k]); };
  const unsigned first = byte(i);
  const size_t length = first < 0x80                     ? 1
                        : first >= 0xC2 && first <= 0xDF ? 2
                        : first >= 0xE0 && first <= 0xEF ? 3
                        : first >= 0xF0 && first <= 0xF4 ? 4
                                                         : 0;
  if (length == 0 || i + length > text.size()) return 0;
  for (size_t k = 1; k < length; ++k) {
    if ((byte(i + k) & 0xC0) != 0x80) return 0;
  }
  if (first == 0xE0 && byte(i + 1) < 0xA0) return 0;
  if (first == 0xED && byte(i + 1) > 0x9F) return 0;
  if (first == 0xF0 && byte(i + 1) < 0x90) return 0;
  if (first == 0xF4 && byte(i + 1) > 0x8F) return 0;
  return length;
}

std::string number_text(double value) {
  char text[64];
  std::snprintf(text, sizeof(text), "%.6g", value);
  return text;
}

}  // namespace

std::string json_string(const std::string& text) {
  std::string result = "\"";
  for (size_t i = 0; i < text.size();) {
    const size_t length = utf8_length(text, i);
    if (length == 0) {
      result += kReplacement;
      ++i;
      continue;
    }
    const unsigned char c = static_cast<unsigned char>(text[i]);
    if (c == '"' || c == '\\') {
      result += '\\';
      result += text[i];
    } else if (c < 0x20) {
      char escaped[8];
      std::snprintf(escaped, sizeof(escaped), "\\u%04x", static_cast<unsigned>(c));
      result += escaped;
    } else {
      result.append(text, i, length);
    }
    i += length;
  }
  return result + "\"";
}

JsonObject& JsonObject::add_raw(const char* key, const std::string& value) {
  if (!members_.empty()) members_ += ", ";
  members_ += json_string(key) + ": " + value;
  return *this;
}

JsonObject& JsonObject::add(const char* key, const std::string& value) {
  return add_raw(key, json_string(value));
}

JsonObject& JsonObject::add(const char* key, int64_t value) {
  return add_raw(key, std::to_string(value));
}

JsonObject& JsonObject::add(const char* key, double value) {
  return add_raw(key, number_text(value));
}

JsonObject& JsonObject::add(const char* key, const std::vector<std::string>& values) {
  std::string list;
  for (const std::string& value : values) list += (list.empty() ? "" : ", ") + json_string(value);
  return add_raw(key, "[" + list + "]");
}

JsonObject& JsonObject::add(const char* key, const std::vector<double>& values) {
  std::string list;
  for (const double value : values) list += (list.empty() ? "" : ", ") + number_text(value);
  return add_raw(key, "[" + list + "]");
}

}  // namespace dehaze
