#include "linux/filesystem/SystemClock.h"

#include <ctime>
#include <thread>

namespace vantrell::linuxos {

FndDate SystemClock::now() {
  timespec time{};
  ::clock_gettime(CLOCK_REALTIME, &time);
  return FndDate::fromUnixTime(time.tv_sec, static_cast<std::uint32_t>(time.tv_nsec));
}

void SystemClock::rest(std::chrono::microseconds duration) {
  std::this_thread::sleep_for(duration);
}

}  // namespace vantrell::linuxos
