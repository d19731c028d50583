#include "linux/filesystem/LinuxFileSystem.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <utility>

#include "linux/PosixError.h"
#include "linux/filesystem/CanonicalPath.h"
#include "linux/filesystem/LinuxDirectoryEnumerator.h"
#include "linux/filesystem/LinuxOpenFile.h"
#include "linux/filesystem/ObjectSpot.h"
#include "linux/filesystem/ResourceValues.h"
#include "linux/filesystem/TreeWalk.h"

namespace vantrell::linuxos {
namespace {

using Key = FndURLResourceKey;
constexpr int kReadFolder = O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_NONBLOCK;

bool holds(std::span<const Key> keys, Key key) {
  return std::find(keys.begin(), keys.end(), key) != keys.end();
}

// Opens `name` in `folder` as a folder, making it when it is not there. An errno value, or 0.
int enterOrMake(FileDescriptor& folder, const std::string& name) {
  constexpr int kFolder = O_PATH | O_DIRECTORY;
  auto below = openWithoutLinks(folder.get(), name, kFolder);
  if (!below && below.error() == ENOENT) {
    const int failed = ::mkdirat(folder.get(), name.c_str(), 0777);
    const int osError = errno;
    if (failed != 0 && osError != EEXIST) return osError;  // another process may be as quick
    below = openWithoutLinks(folder.get(), name, kFolder);
  }
  if (!below) return below.error();
  folder = std::move(*below);
  return 0;
}

}  // namespace

LinuxFileSystem::LinuxFileSystem(FileIndex& index, const TypeRegistry& types,
                                 std::optional<DeviceID> storageDevice)
    : _index(index), _types(types), _storageDevice(storageDevice) {}

Result<void> LinuxFileSystem::readResourceValues(const FndURL& url, std::span<const Key> keys) {
  const auto spot = ObjectSpot::of(url);
  if (!spot) return std::unexpected(readError(spot.error()));
  const auto status = lookAt(spot->folder(), spot->name());
  if (!status) return std::unexpected(readError(status.error()));

  ObjectView view{
      .status = *status,
      .typeIdentifier = _types.typeIdentifierForName(url.lastPathComponent(), status->kind),
      .access = {},
      .documentID = {}};
  view.isPackage = status->kind == FileKind::Directory &&
                   _types.typeConformsTo(view.typeIdentifier, kPackageTypeIdentifier);
  if (holds(keys, Key::IsReadable) || holds(keys, Key::IsWritable)) {
    view.access =
        accessTo(spot->folder(), spot->name(), *status, MountAccess::Unknown, ::geteuid());
  }
  const bool isNamed =
      holds(keys, Key::DocumentIdentifier) && isDocument(status->kind, view.isPackage);
  if (isNamed || holds(keys, Key::FileResourceIdentifier)) {
    const SeenObject object = seenObject(url.path(), *status, view.isPackage);
    if (isNamed) view.documentID = _index.documentIDOfObject(object);
    _index.noteSeen(object);
  }
  const FndURL parent = url.URLByDeletingLastPathComponent();
  const bool isNumbered = !_storageDevice || status->device == *_storageDevice;
  for (const Key key : keys) {
    if (key == Key::FileResourceIdentifier && !isNumbered) continue;
    auto value = makeResourceValue(key, url, parent, view);
    if (value) url.setCachedResourceValue(key, *std::move(value));
  }
  return {};
}

Result<std::unique_ptr<OpenFile>> LinuxFileSystem::open(const FndURL& url, OpenMode mode) {
  auto file = LinuxOpenFile::open(url.path(), mode, _index, _types);
  if (!file) return std::unexpected(std::move(file.error()));
  return *std::move(file);
}

Result<FileStatus> LinuxFileSystem::status(const FndURL& url) {
  const auto spot = ObjectSpot::of(url);
  if (!spot) return std::unexpected(posixError(spot.error()));
  const auto status = lookThroughLinkAt(spot->folder(), spot->name());
  if (!status) return std::unexpected(posixError(status.error()));
  FileStatus answer{.fileID = status->fileID, .linkCount = status->linkCount};
  if (status->kind == FileKind::Directory) {
    const auto entries = _index.entryCountOfFolder(status->fileID);
    if (entries) answer.linkCount = *entries + 2;
  }
  return answer;
}

Result<std::unique_ptr<DirectoryEnumerator>> LinuxFileSystem::enumerateDirectory(
    const FndURL& folder, std::span<const Key> prefetchedKeys, std::uint8_t options,
    DirectoryErrorHandler errorHandler) {
  auto opened = openWithoutLinks(AT_FDCWD, folder.path(), kReadFolder);
  if (!opened) {
    // "No folder" is said of what is there, "nothing there" of a path that leads nowhere.
    const bool isThere =
        opened.error() == ENOTDIR && openWithoutLinks(AT_FDCWD, folder.path(), O_PATH | O_NOFOLLOW);
    return std::unexpected(isThere ? posixError(ENOTDIR) : readError(opened.error()));
  }
  LinuxDirectoryEnumerator::Request request{.folder = folder,
                                            .options = options,
                                            .wantsAccess = holds(prefetchedKeys, Key::IsReadable) ||
                                                           holds(prefetchedKeys, Key::IsWritable),
                                            .errorHandler = std::move(errorHandler)};
  return std::make_unique<LinuxDirectoryEnumerator>(std::move(*opened), std::move(request), _index,
                                                    _types);
}

Result<void> LinuxFileSystem::createDirectory(const FndURL& url) {
  auto folder = openWithoutLinks(AT_FDCWD, "/", O_PATH | O_DIRECTORY);
  if (!folder) return std::unexpected(posixError(folder.error()));
  const std::vector<std::string> components = url.pathComponents();
  if (components.empty()) return std::unexpected(posixError(EINVAL));
  for (std::size_t i = 1; i < components.size(); ++i) {
    if (components[i].find('\0') != std::string::npos) return std::unexpected(posixError(EINVAL));
    int osError = enterOrMake(*folder, components[i]);
    if (osError == ENOTDIR && i + 1 == components.size()) osError = EEXIST;  // as mkdir(2) says
    if (osError != 0) return std::unexpected(posixError(osError));
  }
  return {};
}

Result<std::uint64_t> LinuxFileSystem::recursiveSizeOfDirectory(const FndURL& url) {
  auto folder = openWithoutLinks(AT_FDCWD, url.path(), kReadFolder);
  if (!folder) return std::unexpected(posixError(folder.error()));
  int failure = 0;
  TreeWalk walk(std::move(*folder), url.path(), {.entersFolders = true, .entersPackages = true},
                nullptr, [&failure](const std::string&, int osError) {
                  if (osError != ENOENT) failure = osError;  // what has just gone has no size
                  return failure == 0;
                });
  std::uint64_t bytes = 0;
  while (const WalkEntry* entry = walk.next()) {
    if (entry->status.kind == FileKind::RegularFile) bytes += entry->status.size;
  }
  if (failure != 0) return std::unexpected(posixError(failure));
  return bytes;
}

Result<FndURL> LinuxFileSystem::canonicalURL(const FndURL& url) {
  auto path = canonicalPath(url.path());
  if (!path) return std::unexpected(posixError(path.error()));
  return FndURL::fileURLWithPath(*path);
}

}  // namespace vantrell::linuxos
