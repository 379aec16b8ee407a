#include "stage_threads.h"

#include <chrono>
#include <system_error>

#include "errors.h"
#include "interrupt.h"

namespace dehaze {
namespace {

constexpr std::chrono::milliseconds kLookInterval(50);

}  // namespace

StageThreads::~StageThreads() {
  if (threads_.empty()) return;
  fail(nullptr);
  wait_for_end();
}

void StageThreads::start(std::function<void()> stage) {
  // Until it counts, it cannot end.
  const std::lock_guard<std::mutex> lock(mutex_);
  try {
    threads_.emplace_back([this, stage = std::move(stage)] { run(stage); });
  } catch (const std::system_error& error) {
    throw Error("cannot start a thread: " + error.code().message());
  }
  ++running_;
}

void StageThreads::run(const std::function<void()>& stage) {
  try {
    stage();
  } catch (...) {
    fail(std::current_exception());
  }
  const std::lock_guard<std::mutex> lock(mutex_);
  --running_;
  ended_.notify_all();
}

// Only the first failure counts: the others may follow from it.
void StageThreads::fail(std::exception_ptr failure) {
  {
    const std::lock_guard<std::mutex> lock(mutex_);
    if (!failure_) failure_ = std::move(failure);
  }
  request_stop();
  cancel_();
}

void StageThreads::wait_for_end() {
  {
    std::unique_lock<std::mutex> lock(mutex_);
    while (!ended_.wait_for(lock, kLookInterval, [this] { return running_ == 0; })) {
      if (!is_stopping()) continue;
      // Signals reach one thread only, and a failure none: the others may wait for a pipe. Again
      // and again, because a thread may be just about to begin to wait.
      for (std::thread& thread : threads_) wake_thread(thread.native_handle());
      lock.unlock();
      cancel_();
      lock.lock();
    }
  }
  for (std::thread& thread : threads_) thread.join();
  threads_.clear();
}

void StageThreads::join() {
  wait_for_end();
  throw_if_interrupted();
  if (failure_) std::rethrow_exception(failure_);
}

}  // namespace dehaze
