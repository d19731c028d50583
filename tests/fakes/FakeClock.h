#pragma once

#include <chrono>
#include <mutex>
#include <vector>

#include "platform/Clock.h"

namespace vantrell {

/// A clock that stands still; resting takes no time and is noted.
///
/// Threads: any.
class FakeClock : public Clock {
 public:
  FndDate now() override {
    const std::lock_guard lock(_mutex);
    return _now;
  }
  void rest(std::chrono::microseconds duration) override {
    const std::lock_guard lock(_mutex);
    _rests.push_back(duration);
  }

  void setNow(FndDate now) {
    const std::lock_guard lock(_mutex);
    _now = now;
  }
  std::vector<std::chrono::microseconds> rests() const {
    const std::lock_guard lock(_mutex);
    return _rests;
  }

 private:
  mutable std::mutex _mutex;
  FndDate _now = FndDate::fromUnixTime(1'700'000'000);  // guarded by _mutex
  std::vector<std::chrono::microseconds> _rests;        // guarded by _mutex
};

}  // namespace vantrell
