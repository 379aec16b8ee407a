// One call of the library: its buffers, and what has to be in them afterwards.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "tests/support/fnv1a.h"
#include "tests/support/guarded_bytes.h"

namespace haze::test {

class Call {
 public:
  explicit Call(Placement placement) : placement_(placement) {}
  Call(const Call&) = delete;
  Call& operator=(const Call&) = delete;

  // A buffer that the call only reads.
  template <class T>
  T* reads(const std::vector<T>& content) {
    return rewrites(content, content);
  }

  // A buffer that the call fills: `wanted` replaces the fill that it starts with.
  template <class T>
  T* writes(const std::vector<T>& wanted) {
    std::vector<T> fill(wanted.size());
    if (!fill.empty()) std::memset(fill.data(), kFill, fill.size() * sizeof(T));
    return rewrites(fill, wanted);
  }

  // A buffer that holds `content` and is to hold `wanted`.
  template <class T>
  T* rewrites(const std::vector<T>& content, const std::vector<T>& wanted) {
    return reinterpret_cast<T*>(add(as_bytes(content), as_bytes(wanted), is_float<T>));
  }

  // The same for memory of the library, which holds `content` from prepare() on.
  template <class T>
  void leaves(T* memory, const std::vector<T>& content, const std::vector<T>& wanted) {
    add_global(memory, as_bytes(content), as_bytes(wanted));
  }

  // What a function returns.
  void returns(int wanted) { wanted_result_ = wanted; }

  // Globals to fill before the call, then the call. Only the call runs beside others.
  void before(std::function<void()> fill_globals) { fill_globals_ = std::move(fill_globals); }
  void runs(std::function<void()> call) {
    call_ = [call = std::move(call)] {
      call();
      return 0;
    };
  }
  void runs_for_result(std::function<int()> call) { call_ = std::move(call); }

  void prepare();
  void run() { result_ = call_(); }

  // Empty if everything is as promised; otherwise what is not.
  std::string difference() const;

  // What the buffers hold, and the result. All that is not a number counts as the same.
  void add_to(Fnv1a& digest) const;

  // Whether nothing at all was written, as promised for calls that memory is short for.
  bool untouched() const;

 private:
  static constexpr int kFill = 0xA5;
  template <class T>
  static constexpr bool is_float = false;

  struct Memory {
    std::unique_ptr<GuardedBytes> own;  // null for memory of the library
    uint8_t* bytes;
    std::vector<uint8_t> content;
    std::vector<uint8_t> wanted;
    bool floats;
  };

  template <class T>
  static std::vector<uint8_t> as_bytes(const std::vector<T>& values) {
    std::vector<uint8_t> bytes(values.size() * sizeof(T));
    if (!bytes.empty()) std::memcpy(bytes.data(), values.data(), bytes.size());
    return bytes;
  }

  void* add(std::vector<uint8_t> content, std::vector<uint8_t> wanted, bool floats);
  void add_global(void* memory, std::vector<uint8_t> content, std::vector<uint8_t> wanted);
  static size_t first_difference(const Memory& memory);

  Placement placement_;
  std::vector<Memory> memories_;
  std::function<void()> fill_globals_;
  std::function<int()> call_;
  int wanted_result_ = 0;
  int result_ = 0;
};

template <>
inline constexpr bool Call::is_float<float> = true;

}  // namespace haze::test
