// Stages of one job, each on a thread of its own, that end together: by success, or when one of
// them fails or a signal arrives.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <exception>
#include <functional>
#include <list>
#include <mutex>
#include <thread>
#include <utility>

namespace dehaze {

class StageThreads {
 public:
  // cancel: makes stages that wait for each other return; called from any thread, also twice.
  explicit StageThreads(std::function<void()> cancel) : cancel_(std::move(cancel)) {}
  ~StageThreads();
  StageThreads(const StageThreads&) = delete;
  StageThreads& operator=(const StageThreads&) = delete;

  void start(std::function<void()> stage);

  // Waits until all stages have ended and throws what the first one that failed threw, or
  // Interrupted.
  void join();

 private:
  void run(const std::function<void()>& stage);
  void fail(std::exception_ptr failure);
  void wait_for_end();

  std::function<void()> cancel_;
  std::mutex mutex_;
  std::condition_variable ended_;
  size_t running_ = 0;
  std::exception_ptr failure_;
  std::list<std::thread> threads_;
};

}  // namespace dehaze
