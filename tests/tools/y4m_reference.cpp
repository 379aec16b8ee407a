// What the dehaze command should make of full-range BT.601 Y4M, without any of its code: reads the
// stream on standard input, calls the library, writes the bare 4:2:0 planes to standard output.
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "haze_preview.h"

namespace {

bool read_line(std::string* line) {
  line->clear();
  for (int c = std::getchar(); c != EOF; c = std::getchar()) {
    if (c == '\n') return true;
    line->push_back(static_cast<char>(c));
  }
  return false;
}

int number_after(const std::string& line, const char* mark) {
  const size_t position = line.find(mark);
  return position == std::string::npos ? 0 : std::atoi(line.c_str() + position + 2);
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) return 2;
  const int level = std::atoi(argv[1]);
  std::string line;
  if (!read_line(&line)) return 1;
  const int width = number_after(line, " W");
  const int height = number_after(line, " H");
  const size_t luma = static_cast<size_t>(width) * static_cast<size_t>(height);
  std::vector<unsigned char> planes(luma * 3 / 2);
  std::vector<unsigned char> frame(planes.size());

  InitHazePreviewFormat(kInputFormatNv21, width, height);
  while (read_line(&line)) {
    if (std::fread(planes.data(), 1, planes.size(), stdin) != planes.size()) return 1;
    unsigned char* u = planes.data() + luma;
    unsigned char* v = u + luma / 4;
    frame.assign(planes.begin(), planes.end());
    for (size_t i = 0; i < luma / 4; ++i) {
      frame[luma + 2 * i] = v[i];
      frame[luma + 2 * i + 1] = u[i];
    }
    RemoveHazePreview(frame.data(), width, height, 0, level);
    for (size_t i = 0; i < luma; ++i) planes[i] = frame[i];
    for (size_t i = 0; i < luma / 4; ++i) {
      v[i] = frame[luma + 2 * i];
      u[i] = frame[luma + 2 * i + 1];
    }
    if (std::fwrite(planes.data(), 1, planes.size(), stdout) != planes.size()) return 1;
  }
  ReleaseHazePreview();
  return 0;
}
