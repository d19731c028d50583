#pragma once

#include <sys/resource.h>
#include <unistd.h>

#include <chrono>
#include <cstdint>
#include <cstdio>
#include <fstream>

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

/// The most that it ever held, in bytes.
inline std::uint64_t peakBytes() {
  rusage usage{};
  ::getrusage(RUSAGE_SELF, &usage);
  return static_cast<std::uint64_t>(usage.ru_maxrss) * 1024;
}

/// Says what went wrong and gives the exit status of a measurement that failed.
inline int failed(const FndError& error) {
  std::fprintf(stderr, "%s\n", error.description().c_str());
  return 1;
}

}  // namespace vantrell::bench
