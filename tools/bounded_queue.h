// A queue between two threads that holds no more than it was made for.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <deque>
#include <mutex>
#include <optional>
#include <utility>

namespace dehaze {

template <typename Item>
class BoundedQueue {
 public:
  explicit BoundedQueue(size_t capacity) : capacity_(capacity) {}

  // Waits for room. False if the queue was cancelled: nobody wants the item any more.
  bool push(Item item) {
    std::unique_lock<std::mutex> lock(mutex_);
    changed_.wait(lock, [this] { return is_cancelled_ || items_.size() < capacity_; });
    if (is_cancelled_) return false;
    items_.push_back(std::move(item));
    changed_.notify_all();
    return true;
  }

  // Waits for an item. None when the queue was cancelled, or closed and is empty.
  std::optional<Item> pop() {
    std::unique_lock<std::mutex> lock(mutex_);
    changed_.wait(lock, [this] { return is_cancelled_ || is_closed_ || !items_.empty(); });
    if (is_cancelled_ || items_.empty()) return std::nullopt;
    std::optional<Item> item(std::move(items_.front()));
    items_.pop_front();
    changed_.notify_all();
    return item;
  }

  // Nothing more will be pushed.
  void close() {
    const std::lock_guard<std::mutex> lock(mutex_);
    is_closed_ = true;
    changed_.notify_all();
  }

  void cancel() {
    const std::lock_guard<std::mutex> lock(mutex_);
    is_cancelled_ = true;
    changed_.notify_all();
  }

 private:
  const size_t capacity_;
  std::mutex mutex_;
  std::condition_variable changed_;
  std::deque<Item> items_;
  bool is_closed_ = false;
  bool is_cancelled_ = false;
};

}  // namespace dehaze
