#include "platform/foundation/PosixNames.h"

#include <cerrno>
#include <system_error>

namespace vantrell {

std::string_view posixErrorName(int osError) {
  switch (osError) {
    case E2BIG:
      return "E2BIG";
    case EACCES:
      return "EACCES";
    case EAGAIN:
      return "EAGAIN";
    case EBADF:
      return "EBADF";
    case EBUSY:
      return "EBUSY";
    case EEXIST:
      return "EEXIST";
    case EFBIG:
      return "EFBIG";
    case EINTR:
      return "EINTR";
    case EINVAL:
      return "EINVAL";
    case EIO:
      return "EIO";
    case EISDIR:
      return "EISDIR";
    case ELOOP:
      return "ELOOP";
    case EMFILE:
      return "EMFILE";
    case ENAMETOOLONG:
      return "ENAMETOOLONG";
    case ENFILE:
      return "ENFILE";
    case ENODATA:
      return "ENODATA";
    case ENODEV:
      return "ENODEV";
    case ENOENT:
      return "ENOENT";
    case ENOMEM:
      return "ENOMEM";
    case ENOSPC:
      return "ENOSPC";
    case ENOTDIR:
      return "ENOTDIR";
    case ENOTEMPTY:
      return "ENOTEMPTY";
    case ENOTSUP:
      return "ENOTSUP";
    case ENXIO:
      return "ENXIO";
    case EPERM:
      return "EPERM";
    case ERANGE:
      return "ERANGE";
    case EROFS:
      return "EROFS";
    case ETXTBSY:
      return "ETXTBSY";
    case EXDEV:
      return "EXDEV";
#ifdef EDQUOT
    case EDQUOT:
      return "EDQUOT";
#endif
#ifdef ESTALE
    case ESTALE:
      return "ESTALE";
#endif
    default:
      return {};
  }
}

std::string posixErrorText(int osError) { return std::generic_category().message(osError); }

std::string posixErrorDescription(int osError) {
  const std::string_view name = posixErrorName(osError);
  if (name.empty()) return posixErrorText(osError);
  return std::string(name) + ": " + posixErrorText(osError);
}

}  // namespace vantrell
