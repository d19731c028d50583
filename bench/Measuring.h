#pragma once

#include <unistd.h>

#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>
#include <string_view>

#include "platform/foundation/FndError.h"

namespace vantrell::bench {

using Clock = std::chrono::steady_clock;

inline double millisecondsSince(Clock::time_point start) {
  return std::chrono::duration<double, std::milli>(Clock::now() - start).count();
}

/// The memory that this process holds now, in bytes.
inline std::uint64_t residentBytes() {
  std::ifstream pages("/proc/self/statm");
  std::uint64_t all = 0;
  std::uint64_t resident = 0;
  pages >> all >> resident;
  return resident * static_cast<std::uint64_t>(::sysconf(_SC_PAGESIZE));
}

/// The most that it ever held, in bytes. (getrusage would count what the parent held before it
/// became this program.)
inline std::uint64_t peakBytes() {
  constexpr std::string_view kKey = "VmHWM:";
  std::ifstream status("/proc/self/status");
  for (std::string line; std::getline(status, line);) {
    if (line.starts_with(kKey))
      return std::strtoull(line.c_str() + kKey.size(), nullptr, 10) * 1024;
  }
  return 0;
}

/// Says what went wrong and gives the exit status of a measurement that failed.
inline int failed(const FndError& error) {
  std::fprintf(stderr, "%s\n", error.description().c_str());
  return 1;
}

}  // namespace vantrell::bench
