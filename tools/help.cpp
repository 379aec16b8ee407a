#include "help.h"

#include <sstream>

namespace dehaze {
namespace {

constexpr const char* kExamples =
    "Examples:\n"
    "  dehaze hazy.jpg clear.jpg                    a picture\n"
    "  dehaze drive.mp4 clear.mp4                   a video with its sound\n"
    "  dehaze photos/ -o clear/                     a folder, several files at once\n"
    "  dehaze --strength 40 --max-frames 250 drive.mp4 trial.mp4\n"
    "  dehaze --show compare hazy.jpg before_after.png\n"
    "  dehaze report hazy.jpg -o report.html        a page to look at: dehaze report --help\n"
    "  ffmpeg -i drive.mp4 -f yuv4mpegpipe - | dehaze - - | ffplay -\n"
    "  dehaze --raw 1280x720:nv21@30 - -o clear.mp4 <camera.nv21\n"
    "\n"
    "Usage: dehaze [OPTIONS] INPUT OUTPUT\n"
    "       dehaze [OPTIONS] INPUT... -o OUTPUT\n"
    "       dehaze report [OPTIONS] INPUT -o PAGE.html\n"
    "\n"
    "  INPUT   pictures, videos, folders of them, or - for Y4M on standard input\n"
    "  OUTPUT  picture (.jpg .png .webp), video (.mp4 .mkv .mov .y4m .yuv), folder,\n"
    "          or - for Y4M on standard output\n";

constexpr const char* kExitStatus =
    "Exit status: 0 done, 1 something failed, 2 wrong usage, 128 + n stopped by signal n.\n";

constexpr size_t kNameColumns = 26;
constexpr size_t kTextColumns = 56;

// At spaces, so that no line is longer than it may be; the formatter indents what follows a line
// end.
std::string wrapped(const std::string& text) {
  std::istringstream words(text);
  std::string result;
  size_t column = 0;
  for (std::string word; words >> word; column += word.size()) {
    if (column > 0 && column + 1 + word.size() > kTextColumns) {
      result += '\n';
      column = 0;
    } else if (column > 0) {
      result += ' ';
      ++column;
    }
    result += word;
  }
  return result;
}

}  // namespace

const char* const kHelpSummary = "Takes haze, fog and smog out of pictures and videos.";

HelpFormatter::HelpFormatter() { column_width(kNameColumns); }

std::string HelpFormatter::make_help(const CLI::App* app, std::string,
                                     CLI::AppFormatMode mode) const {
  return std::string(kHelpSummary) + "\n\n" + kExamples + make_groups(app, mode) + kExitStatus;
}

// " N=2": what follows the name of an option.
std::string HelpFormatter::make_option_opts(const CLI::Option* option) const {
  if (option->get_type_size() == 0 || option->get_type_name().empty()) return "";
  const std::string value = option->get_default_str();
  return " " + option->get_type_name() + (value.empty() ? "" : "=" + value);
}

std::string HelpFormatter::make_option_desc(const CLI::Option* option) const {
  return wrapped(option->get_description());
}

}  // namespace dehaze
