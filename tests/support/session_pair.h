// The library's session and the reference's, driven side by side and compared after every call.
#pragma once

#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/session.h"

namespace haze::test {

// Every session global as it is when the library is loaded.
void reset_library_session();

class SessionPair {
 public:
  // Starts from the state after loading but for the cache, which gets a pattern so that bytes show
  // which must stay.
  SessionPair();
  ~SessionPair();
  SessionPair(const SessionPair&) = delete;
  SessionPair& operator=(const SessionPair&) = delete;

  void init(int format, int width, int height);
  void release();
  void set_frame_number(int value);

  // Puts the same block, `bytes` long, into the library and the reference, as a host does.
  void supply_block(const std::vector<uint8_t>& bytes);

  // Runs one frame through both and returns the recovered bytes. A frame out of limits may be
  // passed, too.
  std::vector<uint8_t> remove_haze(const std::vector<uint8_t>& frame, int width, int height,
                                   int level, int recover_arg = 0);

  // Format, counter, light, cache and, up to its end, the working block.
  void expect_equal_state(const char* after) const;

  const reference::ReferenceSession& reference() const { return reference_; }

 private:
  reference::ReferenceSession reference_;
};

}  // namespace haze::test
