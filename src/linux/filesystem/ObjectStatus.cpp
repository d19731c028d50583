#include "linux/filesystem/ObjectStatus.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>
#include <limits>
#include <utility>

namespace vantrell::linuxos {
namespace {

FileKind kindOfMode(unsigned mode) {
  switch (mode & S_IFMT) {
    case S_IFDIR:
      return FileKind::Directory;
    case S_IFLNK:
      return FileKind::SymbolicLink;
    case S_IFIFO:
      return FileKind::Fifo;
    case S_IFSOCK:
      return FileKind::Socket;
    case S_IFCHR:
      return FileKind::CharacterDevice;
    case S_IFBLK:
      return FileKind::BlockDevice;
    default:
      return FileKind::RegularFile;
  }
}

FndDate dateOf(const struct statx_timestamp& time) {
  return FndDate::fromUnixTime(time.tv_sec, time.tv_nsec);
}

OsResult<ObjectStatus> look(int folder, const char* name, int flags) {
  struct statx seen;
  const int failed =
      ::statx(folder, name, flags | AT_NO_AUTOMOUNT, STATX_BASIC_STATS | STATX_BTIME, &seen);
  const int osError = errno;
  if (failed != 0) return std::unexpected(osError);
  ObjectStatus status;
  status.kind = kindOfMode(seen.stx_mode);
  status.fileID = FileID{seen.stx_ino};
  status.device = deviceID(seen.stx_dev_major, seen.stx_dev_minor);
  status.permissions = seen.stx_mode & 07777U;
  status.owner = seen.stx_uid;
  status.linkCount = seen.stx_nlink;
  status.size = seen.stx_size;
  status.modified = dateOf(seen.stx_mtime);
  status.changed = dateOf(seen.stx_ctime);
  if ((seen.stx_mask & STATX_BTIME) != 0) status.created = dateOf(seen.stx_btime);
  status.isImmutable = (seen.stx_attributes & STATX_ATTR_IMMUTABLE) != 0;
  status.isMountPoint = (seen.stx_attributes & STATX_ATTR_MOUNT_ROOT) != 0;
  return status;
}

}  // namespace

OsResult<ObjectStatus> lookAt(int folder, const char* name, int flags) {
  return look(folder, name, flags | AT_SYMLINK_NOFOLLOW);
}

OsResult<ObjectStatus> lookThroughLinkAt(int folder, const char* name) {
  return look(folder, name, 0);
}

DeviceID deviceID(std::uint32_t major, std::uint32_t minor) {
  return DeviceID{(minor & 0xffU) | (major << 8) | ((minor & ~0xffU) << 12)};
}

std::int64_t nanosecondsSince1970(const FndDate& date) {
  constexpr std::int64_t kNanoseconds = 1'000'000'000;
  constexpr std::int64_t kLast = std::numeric_limits<std::int64_t>::max() / kNanoseconds - 1;
  if (date.unixSeconds() > kLast) return std::numeric_limits<std::int64_t>::max();
  if (date.unixSeconds() < -kLast) return std::numeric_limits<std::int64_t>::min();
  return date.unixSeconds() * kNanoseconds + date.nanoseconds();
}

SeenObject seenObject(std::string path, const ObjectStatus& status, bool isPackage) {
  return SeenObject{.path = std::move(path),
                    .kind = status.kind,
                    .isPackage = isPackage,
                    .fileID = status.fileID,
                    .device = status.device,
                    .size = status.size,
                    .modifiedNanoseconds = nanosecondsSince1970(status.modified),
                    .changedNanoseconds = nanosecondsSince1970(status.changed)};
}

}  // namespace vantrell::linuxos
