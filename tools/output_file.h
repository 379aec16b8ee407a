// An output file that appears under its own name only when it is complete.
#pragma once

#include <string>

namespace dehaze {

// Refuses an output that is the input, a folder or a device, lies in a folder that does not exist,
// or exists already (unless `overwrite`). Called before any work is done.
void check_output_path(const std::string& input, const std::string& output, bool overwrite);

// The data goes to ".name.PID.part.ext" in the output's folder, so that the last step is a rename
// within one file system. Whatever is not committed is removed.
class OutputFile {
 public:
  OutputFile(const std::string& path, bool overwrite);
  ~OutputFile();
  OutputFile(const OutputFile&) = delete;
  OutputFile& operator=(const OutputFile&) = delete;

  const std::string& temporary_path() const { return temporary_path_; }

  // Brings the data to the disk and the file to its name.
  void commit();

 private:
  std::string path_;  // symbolic links resolved: what they point to is replaced, not the link
  std::string temporary_path_;
  bool overwrite_;
  bool committed_ = false;
};

}  // namespace dehaze
