#pragma once

#include <cstdint>
#include <cstdlib>
#include <iostream>
#include <random>
#include <string>

namespace vantrell {

/// The seed of the randomized tests of this process: the environment's VANTRELL_SEED, else a new
/// one. It is printed once, so that a failure can be run again, and is rapidcheck's as well when
/// this is called before its first check.
inline std::uint64_t randomSeed() {
  static const std::uint64_t seed = [] {
    const char* const given = std::getenv("VANTRELL_SEED");
    const std::uint64_t chosen =
        given != nullptr ? std::strtoull(given, nullptr, 10) : std::random_device()();
    std::cout << "VANTRELL_SEED=" << chosen << std::endl;
    ::setenv("RC_PARAMS", ("seed=" + std::to_string(chosen)).c_str(), 0);
    return chosen;
  }();
  return seed;
}

}  // namespace vantrell
