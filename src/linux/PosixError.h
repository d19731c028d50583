#pragma once

#include "platform/foundation/FndError.h"

namespace vantrell::linuxos {

/// The POSIX error for an errno value saved right after the failing call.
FndError posixError(int osError);

/// As `posixError`, for reads by place: nothing there (ENOENT, ENOTDIR) becomes the foundation's
/// FileReadNoSuchFile.
FndError readError(int osError);

}  // namespace vantrell::linuxos
