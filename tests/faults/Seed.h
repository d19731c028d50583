#pragma once

#include <cstdint>
#include <cstdlib>
#include <random>

namespace vantrell::faults {

/// The seed that VANTRELL_SEED gives, else another one each time.
inline std::uint64_t seedOrRandom() {
  const char* text = std::getenv("VANTRELL_SEED");
  return text == nullptr ? std::random_device{}() : std::strtoull(text, nullptr, 0);
}

}  // namespace vantrell::faults
