#pragma once

#include <sys/stat.h>

#include <cstdint>
#include <optional>

#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// What tells the object `name` in the folder `folder` from others that had or will have its
/// number: a hash of its kernel file handle, or its birth time where the file system has no
/// handles. With an empty name, the object that `folder` itself is open on (O_PATH will do).
/// None when there is nothing by that name.
///
/// Threads: any.
std::optional<std::uint64_t> generationOf(int folder, const char* name);

}  // namespace vantrell::linuxos::catalog
