// Temporary memory of one call.
#pragma once

#include <stddef.h>
#include <stdint.h>
#include <stdlib.h>

namespace haze {

// `count` elements from malloc, freed at the end of the scope; false if there was not enough
// memory.
template <typename T>
class Scratch {
 public:
  explicit Scratch(size_t count)
      : data_(count <= SIZE_MAX / sizeof(T) ? static_cast<T*>(malloc(count * sizeof(T)))
                                            : nullptr) {}
  ~Scratch() { free(data_); }
  Scratch(const Scratch&) = delete;
  Scratch& operator=(const Scratch&) = delete;

  explicit operator bool() const { return data_ != nullptr; }
  T* data() { return data_; }

 private:
  T* data_;
};

}  // namespace haze
