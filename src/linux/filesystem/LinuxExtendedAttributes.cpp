#include "linux/filesystem/LinuxExtendedAttributes.h"

#include <fcntl.h>
#include <linux/limits.h>
#include <sys/syscall.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <bit>
#include <cerrno>
#include <string>

#include "linux/PosixError.h"
#include "linux/filesystem/AttributeNames.h"
#include "linux/filesystem/ObjectSpot.h"

namespace vantrell::linuxos {
namespace {

// The C library does not know the call yet; number and argument are the kernel's for good.
constexpr long kGetxattrat = 464;
struct GetxattratArguments {
  std::uint64_t value;  // address
  std::uint32_t size;
  std::uint32_t flags;
};

long getxattrat(int folder, const char* name, const char* attribute,
                std::span<std::uint8_t> buffer) {
  GetxattratArguments arguments{
      .value = std::bit_cast<std::uintptr_t>(buffer.data()),
      .size = static_cast<std::uint32_t>(std::min<std::size_t>(buffer.size(), XATTR_SIZE_MAX)),
      .flags = 0};
  return ::syscall(kGetxattrat, folder, name, AT_SYMLINK_NOFOLLOW, attribute, &arguments,
                   sizeof arguments);
}

long getxattrThroughProc(int folder, const char* name, const char* attribute,
                         std::span<std::uint8_t> buffer) {
  std::string path = "/proc/self/fd/" + std::to_string(folder);
  path += '/';
  path += name;
  return ::lgetxattr(path.c_str(), attribute, buffer.data(), buffer.size());
}

// With an empty buffer the answer is the value's size.
Result<std::size_t> readAttribute(AttributeReading reading, const FndURL& url,
                                  std::string_view name, std::span<std::uint8_t> buffer) {
  const auto fullName = linuxAttributeName(name);
  if (!fullName) return std::unexpected(posixError(EINVAL));
  const auto spot = ObjectSpot::of(url);
  if (!spot) return std::unexpected(posixError(spot.error()));
  const auto call = reading == AttributeReading::RelativeCall ? getxattrat : getxattrThroughProc;
  const long size = call(spot->folder(), spot->name(), fullName->c_str(), buffer);
  const int osError = errno;
  if (size < 0) return std::unexpected(posixError(osError));
  return static_cast<std::size_t>(size);
}

}  // namespace

AttributeReading bestAttributeReading() {
  // "/" has no such attribute: ENODATA, or ENOTSUP, is a kernel's that has the call. Sandboxes
  // refuse calls they do not know with EPERM.
  const long size = getxattrat(AT_FDCWD, "/", "user.com.quillon.vantrell.none", {});
  const int osError = errno;
  const bool missing = size < 0 && (osError == ENOSYS || osError == EPERM);
  return missing ? AttributeReading::ThroughProc : AttributeReading::RelativeCall;
}

LinuxExtendedAttributes::LinuxExtendedAttributes(AttributeReading reading) : _reading(reading) {}

Result<std::size_t> LinuxExtendedAttributes::sizeOfAttribute(const FndURL& url,
                                                             std::string_view name) {
  return readAttribute(_reading, url, name, {});
}

Result<std::size_t> LinuxExtendedAttributes::copyAttribute(const FndURL& url, std::string_view name,
                                                           std::span<std::uint8_t> buffer) {
  // The kernel answers an empty buffer with the size alone: a value that has grown meanwhile
  // would look as if it had been copied.
  auto size = readAttribute(_reading, url, name, buffer);
  if (size && *size > buffer.size()) return std::unexpected(posixError(ERANGE));
  return size;
}

}  // namespace vantrell::linuxos
