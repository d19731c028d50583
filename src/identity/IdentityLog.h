#pragma once

#include "platform/foundation/PosixNames.h"
#include "support/Errors.h"
#include "support/Log.h"

namespace vantrell {

/// Writes a line of the identity layer, which carries no prefix for its level.
template <class... Pieces>
void logIdentity(LogLevel level, const Pieces&... pieces) {
  logObject().write(level, pieces...);
}

/// A piece of a line that shows an errno value by name and text.
inline auto errnoText(int osError) {
  return [osError] { return posixErrorDescription(osError); };
}
inline auto errnoText(const FndError& error) { return errnoText(posixCodeOfError(error)); }

}  // namespace vantrell
