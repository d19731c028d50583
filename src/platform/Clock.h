#pragma once

#include <chrono>

#include "platform/foundation/FndDate.h"

namespace vantrell {

/// Time, so that tests need not wait for it.
///
/// Threads: all members may be called from any thread.
class Clock {
 public:
  virtual ~Clock() = default;
  virtual FndDate now() = 0;
  /// Blocks the calling thread for that long.
  virtual void rest(std::chrono::microseconds duration) = 0;
};

}  // namespace vantrell
