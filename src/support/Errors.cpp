#include "support/Errors.h"

#include <cerrno>

namespace vantrell {
namespace {

bool isFoundation(const FndError& error, FndFoundationErrorCode code) {
  return error.is(kFndFoundationErrorDomain, static_cast<std::int64_t>(code));
}

}  // namespace

FndError errorWithPOSIXCode(int osError) { return FndError::posix(osError); }

FndError errorFileWriteNoPermission() {
  return FndError::foundation(FndFoundationErrorCode::FileWriteNoPermission);
}

int posixCodeOfError(const FndError& error) {
  if (error.domain() == kFndPOSIXErrorDomain) return static_cast<int>(error.code());
  if (isNoSuchFileReadError(error)) return ENOENT;
  if (isFoundation(error, FndFoundationErrorCode::FileWriteNoPermission)) return EACCES;
  if (isFoundation(error, FndFoundationErrorCode::FileWriteFileExists)) return EEXIST;
  return EIO;
}

bool isNoSuchFileReadError(const FndError& error) {
  return isFoundation(error, FndFoundationErrorCode::FileReadNoSuchFile);
}

}  // namespace vantrell
