#include "linux/PosixError.h"

#include <cerrno>

namespace vantrell::linuxos {

FndError posixError(int osError) { return FndError::posix(osError); }

FndError readError(int osError) {
  if (osError == ENOENT || osError == ENOTDIR) {
    return FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile);
  }
  return posixError(osError);
}

}  // namespace vantrell::linuxos
