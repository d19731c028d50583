#pragma once

#include "platform/Clock.h"

namespace vantrell::linuxos {

/// The machine's clock.
///
/// Threads: all members may be called from any thread.
class SystemClock : public Clock {
 public:
  FndDate now() override;
  void rest(std::chrono::microseconds duration) override;
};

}  // namespace vantrell::linuxos
