// A child process that works on one file. The library has one session per process, so files are
// processed side by side by processes. The child goes on from fork() with the parsed command line
// as it is; the parent has no threads and no open media at that time.
#pragma once

#include <sys/types.h>

#include <string>
#include <vector>

#include "options.h"

namespace dehaze {

class Worker {
 public:
  // options: of one file.
  explicit Worker(const Options& options);
  // Ends the process if it still runs.
  ~Worker();
  Worker(const Worker&) = delete;
  Worker& operator=(const Worker&) = delete;

  const std::string& input() const { return input_; }
  int descriptor() const { return descriptor_; }  // readable when there is something to receive
  double share() const { return share_; }         // done, 0 ... 1

  // Takes what the process has sent. False when it has ended and everything is here.
  bool receive();

  void terminate();

  bool is_done() const { return is_done_; }
  const std::string& failure() const { return failure_; }
  const std::string& json() const { return json_; }

  // What is to be printed about the file, taken once: notes, what is printed in spite of --quiet,
  // and what goes to standard output.
  std::vector<std::string> take_notes();
  std::vector<std::string> take_infos();
  std::vector<std::string> take_output();

 private:
  void handle(const std::string& line);
  void wait();

  std::string input_;
  pid_t process_ = -1;
  int descriptor_ = -1;
  std::string received_;  // an unfinished line
  double share_ = 0;
  bool is_done_ = false;
  std::string failure_;
  std::string json_;
  std::vector<std::string> notes_;
  std::vector<std::string> infos_;
  std::vector<std::string> output_;
};

}  // namespace dehaze
