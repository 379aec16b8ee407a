// Lines for other programs.
#pragma once

#include <cstdio>
#include <string>

namespace dehaze {

// Complete when it returns. Throws Interrupted if the reader of the pipe went away, Error if it
// cannot be written.
void print_line(std::FILE* file, const std::string& line);

}  // namespace dehaze
