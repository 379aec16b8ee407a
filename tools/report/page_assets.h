// Style and script of the page: page.css and page.js, taken in by the build.
#ifndef TOOLS_REPORT_PAGE_ASSETS_H
#define TOOLS_REPORT_PAGE_ASSETS_H

namespace dehaze {

extern const char* const kPageStyle;
extern const char* const kPageScript;

}  // namespace dehaze

#endif  // TOOLS_REPORT_PAGE_ASSETS_H
