// `dehaze report`: what the haze removal does to a picture or a video, as one page.
#ifndef TOOLS_REPORT_RUN_H
#define TOOLS_REPORT_RUN_H

#include "errors.h"

namespace dehaze {

// Takes the words from "report" on. Throws what goes wrong.
ExitStatus run_report(int argc, char** argv);

}  // namespace dehaze

#endif  // TOOLS_REPORT_RUN_H
