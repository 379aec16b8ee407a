// Feeds files, and all files in folders, to a fuzzer: fuzz_NAME FILE|FOLDER...
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count);

namespace {

using std::filesystem::path;

void collect(const path& from, std::vector<path>& files) {
  if (!std::filesystem::is_directory(from)) {
    files.push_back(from);
    return;
  }
  for (const auto& entry : std::filesystem::recursive_directory_iterator(from))
    if (entry.is_regular_file()) files.push_back(entry.path());
}

bool replay(const path& file) {
  std::ifstream stream(file, std::ios::binary);
  if (!stream) {
    std::fprintf(stderr, "%s: cannot be read\n", file.c_str());
    return false;
  }
  const std::vector<char> content((std::istreambuf_iterator<char>(stream)), {});
  // Told before it runs, so that the name of a file that ends the program is known.
  std::printf("%s\n", file.c_str());
  std::fflush(stdout);
  LLVMFuzzerTestOneInput(reinterpret_cast<const uint8_t*>(content.data()), content.size());
  return true;
}

}  // namespace

int main(int argc, char** argv) {
  std::vector<path> files;
  for (int i = 1; i < argc; ++i) collect(argv[i], files);
  std::sort(files.begin(), files.end());
  if (files.empty()) return std::fprintf(stderr, "usage: %s FILE|FOLDER...\n", argv[0]), 2;
  const bool all_read = std::all_of(files.begin(), files.end(), replay);
  std::printf("%zu files replayed\n", files.size());
  return all_read ? 0 : 1;
}
