#pragma once

#include <optional>
#include <string>

#include "platform/foundation/FndURL.h"

namespace vantrell {

// One resource value of the object at a URL, as its URL object remembers it or else as it is
// read now. None when the object has no such value, when it is of another type, and when it
// cannot be read, which is logged at error level.
//
// Threads: any.

std::optional<std::string> stringResource(FndURLResourceKey key, const FndURL& url);
std::optional<FndNumber> numberResource(FndURLResourceKey key, const FndURL& url);
std::optional<FndDate> dateResource(FndURLResourceKey key, const FndURL& url);
/// Three answers: true, false, and none.
std::optional<bool> boolResource(FndURLResourceKey key, const FndURL& url);
std::optional<FndData> dataResource(FndURLResourceKey key, const FndURL& url);

}  // namespace vantrell
