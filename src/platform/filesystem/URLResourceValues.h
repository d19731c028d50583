#pragma once

#include <optional>
#include <string_view>

#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// The value of `key` for the file at `url`: the one its URL object remembers, else read now and
/// remembered. None when this object has no such value.
/// Errors: 260 when nothing is there, else POSIX.
Result<std::optional<FndURL::ResourceValue>> resourceValue(const FndURL& url,
                                                           FndURLResourceKey key);

}  // namespace vantrell
