#include "print_line.h"

#include <cerrno>
#include <csignal>
#include <cstring>

#include "errors.h"

namespace dehaze {

void print_line(std::FILE* file, const std::string& line) {
  const bool written = std::fputs((line + "\n").c_str(), file) >= 0 && std::fflush(file) == 0;
  if (written) return;
  if (errno == EPIPE) throw Interrupted(SIGPIPE);
  throw Error(std::string("cannot write to standard output: ") + std::strerror(errno));
}

}  // namespace dehaze
