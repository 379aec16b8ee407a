// Style and script of the page: page.css and page.js, taken in by the build.
#pragma once

namespace dehaze {

extern const char* const kPageStyle;
extern const char* const kPageScript;

}  // namespace dehaze
