#include "linux/filesystem/Places.h"

#include <fcntl.h>
#include <linux/openat2.h>
#include <sys/syscall.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <climits>

namespace vantrell::linuxos {
namespace {

// One call of the kernel's; `path` is shorter than PATH_MAX.
OsResult<FileDescriptor> openOnce(int folder, std::string_view path, int flags) {
  std::array<char, PATH_MAX> text;
  *std::copy(path.begin(), path.end(), text.begin()) = '\0';
  open_how how{};
  how.flags = static_cast<std::uint64_t>(flags | O_CLOEXEC);
  how.resolve = RESOLVE_NO_SYMLINKS;
  const long fd = ::syscall(SYS_openat2, folder, text.data(), &how, sizeof how);
  const int osError = errno;
  if (fd < 0) return std::unexpected(osError);
  return FileDescriptor(static_cast<int>(fd));
}

}  // namespace

OsResult<FileDescriptor> openWithoutLinks(int folder, std::string_view path, int flags) {
  if (path.empty() || path.find('\0') != std::string_view::npos) return std::unexpected(EINVAL);
  FileDescriptor reached;
  while (path.size() >= PATH_MAX) {
    const std::size_t slash = path.rfind('/', PATH_MAX - 1);
    if (slash == std::string_view::npos || slash == 0) return std::unexpected(ENAMETOOLONG);
    auto step = openOnce(folder, path.substr(0, slash), O_PATH | O_DIRECTORY);
    if (!step) return step;
    reached = std::move(*step);
    folder = reached.get();
    path.remove_prefix(slash + 1);
  }
  return openOnce(folder, path, flags);
}

OsResult<Place> placeOf(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) return std::unexpected(EINVAL);  // no file URL has such a path
  std::string_view name = std::string_view(path).substr(slash + 1);
  if (name.find('\0') != std::string_view::npos) return std::unexpected(EINVAL);
  if (name.empty()) name = ".";
  const std::string_view folder = slash == 0 ? "/" : std::string_view(path).substr(0, slash);
  auto opened = openWithoutLinks(AT_FDCWD, folder, O_PATH | O_DIRECTORY);
  if (!opened) return std::unexpected(opened.error());
  return Place{std::move(*opened), name};
}

}  // namespace vantrell::linuxos
