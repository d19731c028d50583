#pragma once

#include <cstddef>

namespace vantrell {

/// Measures what is allocated with `new` while it lives, on every thread of the process. A program
/// that uses it links MemoryMeter.cpp, which replaces the allocation functions.
///
/// Threads: one meter at a time.
class MemoryMeter {
 public:
  MemoryMeter();
  /// The most bytes held at one time, beyond those held when the meter was made.
  std::size_t peakBytes() const;

 private:
  std::size_t _before;
};

}  // namespace vantrell
