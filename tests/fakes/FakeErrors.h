#pragma once

#include <expected>

#include "platform/foundation/FndError.h"

namespace vantrell {

/// The failure of a fake's call with that errno value.
inline std::unexpected<FndError> fakeFailure(int osError) {
  return std::unexpected(FndError::posix(osError));
}

}  // namespace vantrell
