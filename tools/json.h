// One JSON object on one line (RFC 8259).
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace dehaze {

class JsonObject {
 public:
  JsonObject& add(const char* key, const std::string& value);
  JsonObject& add(const char* key, const char* value) { return add(key, std::string(value)); }
  JsonObject& add(const char* key, int64_t value);
  JsonObject& add(const char* key, double value);  // finite
  JsonObject& add(const char* key, const std::vector<std::string>& values);
  JsonObject& add(const char* key, const std::vector<double>& values);
  JsonObject& add(const char* key, const JsonObject& object) { return add_raw(key, object.text()); }

  std::string text() const { return "{" + members_ + "}"; }

 private:
  JsonObject& add_raw(const char* key, const std::string& value);

  std::string members_;
};

// File names are bytes; what is no UTF-8 becomes U+FFFD, because JSON text has to be UTF-8.
std::string json_string(const std::string& text);

}  // namespace dehaze
