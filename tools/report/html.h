// Text that becomes part of a page.
#pragma once

#include <string>

namespace dehaze {

// For element content and quoted attributes. Bytes that are no UTF-8 stay: a browser shows U+FFFD
// for them, and never takes the character after them along.
std::string escaped(const std::string& text);

// "data:image/jpeg;base64,..." (RFC 2397, RFC 4648).
std::string jpeg_uri(const std::string& bytes);

// With that many decimals, whatever the locale; infinity as the character.
std::string number(double value, int decimals);

}  // namespace dehaze
