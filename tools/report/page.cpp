#include "report/page.h"

#include "haze_preview.h"
#include "report/html.h"
#include "report/page_assets.h"
#include "report/page_pictures.h"
#include "report/page_tables.h"

namespace dehaze {
namespace {

// Whatever ends up in the page, a browser loads nothing for it.
constexpr const char* kPolicy =
    "default-src 'none'; img-src data:; style-src 'unsafe-inline'; script-src 'unsafe-inline'";

std::string head(const std::string& title) {
  return std::string("<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n") +
         "<meta http-equiv=\"Content-Security-Policy\" content=\"" + kPolicy + "\">\n" +
         "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\">\n" +
         "<meta name=\"generator\" content=\"dehaze " HAZE_PREVIEW_VERSION_STRING "\">\n" +
         "<title>" + escaped(title) + "</title>\n<style>\n" + kPageStyle + "</style>\n</head>\n";
}

// Nothing for an empty content.
std::string section(const std::string& title, const std::string& content) {
  if (content.empty()) return "";
  return "<section>\n<h2>" + escaped(title) + "</h2>\n" + content + "</section>\n";
}

}  // namespace

std::string report_page(const ReportData& data) {
  return head(data.input_name + " - haze report") + "<body>\n<header><h1>" +
         escaped(data.input_name) + "</h1></header>\n<main>\n" + comparison(data) +
         frame_choice(data) + facts(data) + section("What was found", findings(data)) +
         section("Over time", over_time(data)) +
         section("Closeness to the clear reference", quality(data)) +
         section("Time in the library", timing(data)) + section("Settings", settings(data)) +
         section("Notes", notes(data)) +
         "</main>\n<footer>Made by dehaze " HAZE_PREVIEW_VERSION_STRING "</footer>\n<script>\n" +
         kPageScript + "</script>\n</body>\n</html>\n";
}

}  // namespace dehaze
