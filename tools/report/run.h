// `dehaze report`: what the haze removal does to a picture or a video, as one page.
#pragma once

#include "errors.h"

namespace dehaze {

// Takes the words from "report" on. Throws what goes wrong.
ExitStatus run_report(int argc, char** argv);

}  // namespace dehaze
