// Lines for other programs.
#ifndef TOOLS_PRINT_LINE_H
#define TOOLS_PRINT_LINE_H

#include <cstdio>
#include <string>

namespace dehaze {

// Complete when it returns. Throws Interrupted if the reader of the pipe went away, Error if it
// cannot be written.
void print_line(std::FILE* file, const std::string& line);

}  // namespace dehaze

#endif  // TOOLS_PRINT_LINE_H
