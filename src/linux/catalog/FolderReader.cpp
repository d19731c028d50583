#include "linux/catalog/FolderReader.h"

#include <fcntl.h>
#include <linux/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <ctime>

#include "linux/catalog/Names.h"
#include "linux/filesystem/ObjectStatus.h"

namespace vantrell::linuxos::catalog {

namespace {

constexpr std::size_t kBufferBytes = 64 * 1024;
constexpr std::int64_t kNanosecondsInSecond = 1'000'000'000;
// Kernels stamp changes with a clock that ticks every 1 to 10 ms, and FAT every 2 s for mtime
// but 10 ms for ctime. Within that time a second change may carry the same stamp.
constexpr std::int64_t kRecentNanoseconds = 50'000'000;

/// What getdents64 puts in front of each name.
struct DirectoryRecord {
  std::uint64_t inode;
  std::int64_t next;
  unsigned short length;
  unsigned char type;
  char name[1];
};

std::int64_t nanoseconds(const struct statx_timestamp& time) {
  return time.tv_sec * kNanosecondsInSecond + time.tv_nsec;
}

FileKind fileKindOf(unsigned mode) {
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

OsResult<struct statx> statusAt(int folder, const char* name) {
  struct statx status {};
  const int flags = AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT | AT_EMPTY_PATH;
  const int failed = ::statx(folder, name, flags, STATX_BASIC_STATS, &status);
  const int osError = errno;
  if (failed != 0) return std::unexpected(osError);
  return status;
}

bool isPackageName(const TypeRegistry& types, std::string_view name) {
  // No extension, no package: most folders are told apart here.
  if (name.find('.') == std::string_view::npos) return false;
  return types.typeConformsTo(types.typeIdentifierForName(name, FileKind::Directory),
                              kPackageTypeIdentifier);
}

/// `lookedAt` is a time before the look, so that whatever changed since counts as recent.
void fill(Entry& entry, const struct statx& status, std::int64_t lookedAt) {
  entry.fileID = FileID{status.stx_ino};
  entry.kind = EntryKind::of(fileKindOf(status.stx_mode));
  entry.size = status.stx_size;
  entry.modifiedNanoseconds = nanoseconds(status.stx_mtime);
  entry.changedNanoseconds = nanoseconds(status.stx_ctime);
  if (lookedAt - entry.changedNanoseconds < kRecentNanoseconds) {
    entry.kind = entry.kind.with(EntryKind::kRecent);
  }
}

DeviceID deviceOf(const struct statx& status) {
  return linuxos::deviceID(status.stx_dev_major, status.stx_dev_minor);
}

}  // namespace

std::int64_t nowNanoseconds() {
  struct timespec now {};
  ::clock_gettime(CLOCK_REALTIME, &now);
  return now.tv_sec * kNanosecondsInSecond + now.tv_nsec;
}

OsResult<Entry> lookAtDescriptor(int descriptor, DeviceID* device) {
  const std::int64_t before = nowNanoseconds();
  const auto status = statusAt(descriptor, "");
  if (!status) return std::unexpected(status.error());
  Entry entry;
  fill(entry, *status, before);
  if (device != nullptr) *device = deviceOf(*status);
  return entry;
}

FolderReader::FolderReader(int folder, const FolderRules& rules) : _folder(folder), _rules(rules) {}

bool FolderReader::isCatalogued(std::string_view name) const {
  return !isHiddenName(name) || (_rules.mayHoldTrash && name == kTrashFolderName);
}

OsResult<std::optional<Entry>> FolderReader::lookAt(const std::string& name) const {
  if (!isCatalogued(name)) return std::nullopt;
  const std::int64_t before = nowNanoseconds();
  const auto status = statusAt(_folder, name.c_str());
  if (!status && (status.error() == ENOENT || status.error() == ENOTDIR)) return std::nullopt;
  if (!status) return std::unexpected(status.error());
  // A bind mount of the same volume would show a second place for what has one already, and may
  // even lead into a circle.
  const bool isMountPoint = (status->stx_attributes & STATX_ATTR_MOUNT_ROOT) != 0;
  if (isMountPoint || deviceOf(*status) != _rules.device) return std::nullopt;
  Entry entry;
  entry.name = name;
  fill(entry, *status, before);
  if (isHiddenName(name) && !entry.kind.isDirectory()) return std::nullopt;
  if (entry.kind.isDirectory() && isPackageName(_rules.types, name)) {
    entry.kind = entry.kind.with(EntryKind::kPackage);
  }
  if (_rules.isInsidePackage) entry.kind = entry.kind.with(EntryKind::kInsidePackage);
  return entry;
}

OsResult<std::vector<Entry>> FolderReader::next(std::size_t limit) {
  _buffer.resize(kBufferBytes);
  std::vector<Entry> entries;
  while (entries.size() < limit) {
    const long count = ::syscall(SYS_getdents64, _folder, _buffer.data(), _buffer.size());
    const int osError = errno;
    if (count < 0) return std::unexpected(osError);
    if (count == 0) break;
    for (long offset = 0; offset < count;) {
      const char* const record = _buffer.data() + offset;
      unsigned short length = 0;
      std::memcpy(&length, record + offsetof(DirectoryRecord, length), sizeof length);
      offset += length;
      auto entry = lookAt(record + offsetof(DirectoryRecord, name));
      if (!entry) return std::unexpected(entry.error());
      if (*entry) entries.push_back(std::move(**entry));
    }
  }
  std::ranges::sort(entries, {}, &Entry::name);
  return entries;
}

}  // namespace vantrell::linuxos::catalog
