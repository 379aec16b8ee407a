#include "report/html.h"

#include <cmath>
#include <cstdint>
#include <cstdio>

namespace dehaze {
namespace {

const char* entity_of(char c) {
  switch (c) {
    case '&':
      return "&amp;";
    case '<':
      return "&lt;";
    case '>':
      return "&gt;";
    case '"':
      return "&quot;";
    case '\'':
      return "&#39;";
    default:
      return nullptr;
  }
}

std::string base64(const std::string& bytes) {
  constexpr char kDigits[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  std::string text;
  text.reserve((bytes.size() + 2) / 3 * 4);
  for (size_t i = 0; i < bytes.size(); i += 3) {
    const auto byte = [&](size_t k) -> uint32_t {
      return i + k < bytes.size() ? static_cast<unsigned char>(bytes[i + k]) : 0;
    };
    const uint32_t group = byte(0) << 16 | byte(1) << 8 | byte(2);
    for (int shift = 18; shift >= 0; shift -= 6) text += kDigits[group >> shift & 63];
  }
  // Digits that hold nothing of the last one or two bytes.
  const size_t missing = (3 - bytes.size() % 3) % 3;
  text.replace(text.size() - missing, missing, missing, '=');
  return text;
}

}  // namespace

std::string escaped(const std::string& text) {
  std::string result;
  for (const char c : text) {
    const char* const entity = entity_of(c);
    if (entity != nullptr) {
      result += entity;
    } else {
      result += c;
    }
  }
  return result;
}

std::string jpeg_uri(const std::string& bytes) { return "data:image/jpeg;base64," + base64(bytes); }

std::string number(double value, int decimals) {
  if (std::isinf(value)) return "\u221E";
  char text[64];
  std::snprintf(text, sizeof(text), "%.*f", decimals, value);
  return text;
}

}  // namespace dehaze
