#include "platform/foundation/PosixNames.h"

#include <cerrno>
#include <system_error>

namespace vantrell {
namespace {

struct PosixName {
  int osError;
  std::string_view name;
};

constexpr PosixName kPosixNames[] = {
    {E2BIG, "E2BIG"},     {EACCES, "EACCES"},
    {EAGAIN, "EAGAIN"},   {EBADF, "EBADF"},
    {EBUSY, "EBUSY"},     {EEXIST, "EEXIST"},
    {EFBIG, "EFBIG"},     {EINTR, "EINTR"},
    {EINVAL, "EINVAL"},   {EIO, "EIO"},
    {EISDIR, "EISDIR"},   {ELOOP, "ELOOP"},
    {EMFILE, "EMFILE"},   {ENAMETOOLONG, "ENAMETOOLONG"},
    {ENFILE, "ENFILE"},   {ENODATA, "ENODATA"},
    {ENODEV, "ENODEV"},   {ENOENT, "ENOENT"},
    {ENOMEM, "ENOMEM"},   {ENOSPC, "ENOSPC"},
    {ENOTDIR, "ENOTDIR"}, {ENOTEMPTY, "ENOTEMPTY"},
    {ENOTSUP, "ENOTSUP"}, {ENXIO, "ENXIO"},
    {EPERM, "EPERM"},     {ERANGE, "ERANGE"},
    {EROFS, "EROFS"},     {ETXTBSY, "ETXTBSY"},
    {EXDEV, "EXDEV"},
#ifdef EDQUOT
    {EDQUOT, "EDQUOT"},
#endif
#ifdef ESTALE
    {ESTALE, "ESTALE"},
#endif
};

}  // namespace

std::string_view posixErrorName(int osError) {
  for (const PosixName& known : kPosixNames) {
    if (known.osError == osError) return known.name;
  }
  return {};
}

std::string posixErrorText(int osError) { return std::generic_category().message(osError); }

std::string posixErrorDescription(int osError) {
  const std::string_view name = posixErrorName(osError);
  if (name.empty()) return posixErrorText(osError);
  return std::string(name) + ": " + posixErrorText(osError);
}

}  // namespace vantrell
