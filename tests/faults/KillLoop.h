#pragma once

namespace vantrell::faults {

/// Kills a working catalog that often, each time at another moment, and fails the current test
/// when one of its promises was broken. Prints its seed; VANTRELL_SEED repeats it.
void killOftenAndJudge(int cycles);

}  // namespace vantrell::faults
