#pragma once

#include <string_view>

namespace vantrell {

/// Ends the process after writing `message` to standard error: for programming errors only.
[[noreturn]] void fatalError(std::string_view message);

/// Ends the process with `message` in a build with assertions when `condition` is false.
inline void developmentAssert([[maybe_unused]] bool condition,
                              [[maybe_unused]] std::string_view message) {
#ifdef VANTRELL_ASSERTIONS
  if (!condition) fatalError(message);
#endif
}

}  // namespace vantrell
