#pragma once

#include "platform/foundation/FndError.h"

namespace vantrell {

/// The POSIX-domain error with that errno value and no user info.
FndError errorWithPOSIXCode(int osError);

/// Code 513 of the foundation's domain: writing is not permitted there.
FndError errorFileWriteNoPermission();

/// The errno value that says best what `error` says; EIO for an error of another domain that
/// has no counterpart.
int posixCodeOfError(const FndError& error);

/// True for the foundation's code 260: nothing is there to be read.
bool isNoSuchFileReadError(const FndError& error);

}  // namespace vantrell
