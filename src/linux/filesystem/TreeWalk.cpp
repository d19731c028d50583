#include "linux/filesystem/TreeWalk.h"

#include <fcntl.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <cstddef>
#include <cstring>
#include <utility>

namespace vantrell::linuxos {
namespace {

// Some hundreds of entries with usual names: enough to spread the cost of a call over them.
constexpr std::size_t kBufferSize = 32 * 1024;
// Of the innermost folders. A process may often have no more than 1,024 descriptors.
constexpr std::size_t kMostOpenFolders = 16;
constexpr int kReadFolder = O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC;

// A directory entry as getdents64(2) lays it out; the name follows and ends in NUL.
struct DirectoryRecord {
  std::uint64_t inode;
  std::int64_t nextPosition;
  std::uint16_t length;
  std::uint8_t type;
};
constexpr std::size_t kNameOffset = offsetof(DirectoryRecord, type) + 1;

bool isSkipped(std::string_view name, bool skipsHidden) {
  if (name == "." || name == "..") return true;
  return skipsHidden && name.starts_with('.');
}

}  // namespace

TreeWalk::TreeWalk(FileDescriptor folder, std::string path, WalkOptions options, Preparer preparer,
                   ErrorHandler errorHandler)
    : _path(std::move(path)),
      _options(options),
      _preparer(std::move(preparer)),
      _errorHandler(std::move(errorHandler)),
      _buffer(kBufferSize) {
  if (_path == "/") _path.clear();
  const auto status = lookAt(folder.get(), "", AT_EMPTY_PATH);
  if (!status) {
    report({}, status.error());
    return;
  }
  _device = status->device;
  push(std::move(folder), *status);
}

const WalkEntry* TreeWalk::next() {
  if (_entering != nullptr) enter(*std::exchange(_entering, nullptr));
  while (!_stopped && !_levels.empty()) {
    Level& level = _levels.back();
    if (level.given == level.entries.size()) {
      if (!readMore(level)) leave();
      continue;
    }
    const WalkEntry& entry = level.entries[level.given++];
    level.position = entry.nextPosition;
    if (entry.osError != 0) {
      report(entry.name, entry.osError);
      continue;
    }
    if (shouldEnter(entry)) _entering = &entry;
    return &entry;
  }
  return nullptr;
}

WalkFolder TreeWalk::folder() const { return folderOf(_levels.back()); }

WalkFolder TreeWalk::folderOf(const Level& level) const {
  return {.descriptor = level.descriptor, .status = level.status, .path = _path};
}

// False at the end of the folder, and for one that cannot be read on.
bool TreeWalk::readMore(Level& level) {
  const long size =
      ::syscall(SYS_getdents64, level.descriptor->get(), _buffer.data(), _buffer.size());
  const int osError = errno;
  // A folder that was removed while it is open ends here.
  if (size < 0 && osError != ENOENT) report({}, osError);
  if (size <= 0) return false;
  takeEntries(level, static_cast<std::size_t>(size));
  if (_preparer) _preparer(folderOf(level), level.entries);
  return true;
}

void TreeWalk::takeEntries(Level& level, std::size_t size) {
  level.names.assign(_buffer.begin(), _buffer.begin() + static_cast<std::ptrdiff_t>(size));
  level.entries.clear();
  level.given = 0;
  DirectoryRecord record;
  for (std::size_t offset = 0; offset + kNameOffset < size; offset += record.length) {
    std::memcpy(&record, level.names.data() + offset, kNameOffset);
    const std::string_view name(level.names.data() + offset + kNameOffset);
    level.position = record.nextPosition;
    if (isSkipped(name, _options.skipsHidden)) continue;
    WalkEntry& entry = level.entries.emplace_back();
    entry.name = name;
    entry.nextPosition = record.nextPosition;
    if (auto status = lookAt(level.descriptor->get(), name.data())) {
      entry.status = *status;
    } else {
      entry.osError = status.error();
    }
  }
}

bool TreeWalk::shouldEnter(const WalkEntry& entry) const {
  const ObjectStatus& status = entry.status;
  // A bind mount may lead back to a folder above: never onto what is mounted.
  return _options.entersFolders && status.kind == FileKind::Directory && status.device == _device &&
         !status.isMountPoint && (!entry.isPackage || _options.entersPackages);
}

void TreeWalk::enter(const WalkEntry& entry) {
  FileDescriptor below(::openat(_levels.back().descriptor->get(), entry.name.data(), kReadFolder));
  const int osError = errno;
  if (!below) return report(entry.name, osError == ENOTDIR ? ENOENT : osError);
  const auto status = lookAt(below.get(), "", AT_EMPTY_PATH);
  if (!status) return report(entry.name, status.error());
  if (status->device != _device) return;  // mounted there since it was looked at
  _path += '/';
  _path += entry.name;
  push(std::move(below), *status);
}

void TreeWalk::push(FileDescriptor descriptor, const ObjectStatus& status) {
  Level& level = _levels.emplace_back();
  level.descriptor = std::make_shared<FileDescriptor>(std::move(descriptor));
  level.status = status;
  level.pathLength = _path.size();
  if (_levels.size() <= kMostOpenFolders) return;
  Level& outer = _levels[_levels.size() - 1 - kMostOpenFolders];
  outer.descriptor.reset();
  outer.names = {};
  outer.entries = {};
  outer.given = 0;
}

void TreeWalk::leave() {
  std::shared_ptr<const FileDescriptor> below = std::move(_levels.back().descriptor);
  _levels.pop_back();
  while (!_stopped && !_levels.empty()) {
    Level& level = _levels.back();
    _path.resize(level.pathLength);
    if (level.descriptor != nullptr || reopen(level, below.get())) return;
    report({}, ENOENT);  // moved away: what was left of it is no longer here
    _levels.pop_back();
    below.reset();
  }
}

// By way of the folder below it if there is one, which holds even when its path has changed.
bool TreeWalk::reopen(Level& level, const FileDescriptor* below) {
  FileDescriptor again(below != nullptr ? ::openat(below->get(), "..", kReadFolder) : -1);
  const auto isThisFolder = [&level](const FileDescriptor& folder) {
    const auto status = lookAt(folder.get(), "", AT_EMPTY_PATH);
    return status && status->isSameObjectAs(level.status);
  };
  if (!again || !isThisFolder(again)) {
    auto byPath = openWithoutLinks(AT_FDCWD, _path.empty() ? "/" : _path, kReadFolder);
    if (!byPath || !isThisFolder(*byPath)) return false;
    again = std::move(*byPath);
  }
  if (::lseek(again.get(), level.position, SEEK_SET) < 0) return false;
  level.descriptor = std::make_shared<FileDescriptor>(std::move(again));
  return true;
}

void TreeWalk::report(std::string_view name, int osError) {
  std::string path = _path;
  if (!name.empty()) {
    path += '/';
    path += name;
  }
  if (!_errorHandler(path.empty() ? "/" : path, osError)) _stopped = true;
}

}  // namespace vantrell::linuxos
