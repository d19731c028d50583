#include "linux/filesystem/LinuxVolumes.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>
#include <utility>

#include "linux/PosixError.h"
#include "linux/filesystem/ObjectSpot.h"
#include "linux/filesystem/VolumeIdentity.h"

namespace vantrell::linuxos {
namespace {

// The folder at `path`, or the one that holds what stands there, opened for reading.
OsResult<FileDescriptor> openNearestFolder(std::string_view path) {
  constexpr int kReadFolder = O_RDONLY | O_DIRECTORY | O_NONBLOCK;
  auto opened = openWithoutLinks(AT_FDCWD, path, kReadFolder);
  const bool isNoFolder =
      !opened && (opened.error() == ENOTDIR || opened.error() == ELOOP) && path.size() > 1;
  if (!isNoFolder) return opened;
  const std::size_t slash = path.rfind('/');
  return openWithoutLinks(AT_FDCWD, slash == 0 ? "/" : path.substr(0, slash), kReadFolder);
}

std::optional<FndUUID> ownUUID(int folder) {
  if (const auto uuid = fileSystemUUID(folder)) return uuid;
  struct stat status;
  if (::fstat(folder, &status) != 0) return std::nullopt;
  return blockDeviceUUID("/dev/disk/by-uuid", status.st_dev);
}

}  // namespace

LinuxVolumes::LinuxVolumes(FileIndex& index, std::string storageRoot)
    : _index(index), _storageRoot(std::move(storageRoot)) {}

Result<ObjectStatus> LinuxVolumes::lookAtStorageRoot() const {
  const auto place = placeOf(_storageRoot);
  if (!place) return std::unexpected(posixError(place.error()));
  const auto status = lookAt(place->folder.get(), place->name.data());
  if (!status) return std::unexpected(posixError(status.error()));
  return *status;
}

Result<FndUUID> LinuxVolumes::volumeUUIDForURL(const FndURL& url) {
  const auto spot = ObjectSpot::of(url);
  if (!spot) return std::unexpected(posixError(spot.error()));
  const auto object = lookAt(spot->folder(), spot->name());
  if (!object) return std::unexpected(posixError(object.error()));
  const auto root = lookAtStorageRoot();
  if (!root) return std::unexpected(root.error());

  const bool isStorage = object->device == root->device;
  const auto folder = openNearestFolder(isStorage ? _storageRoot : url.path());
  if (!folder) return std::unexpected(posixError(folder.error()));
  if (const auto uuid = ownUUID(folder->get())) return *uuid;
  if (!isStorage) return std::unexpected(posixError(ENODATA));
  const auto kept = keptVolumeUUID(folder->get(), root->fileID);
  if (!kept) return std::unexpected(posixError(kept.error()));
  return *kept;
}

Result<std::string> LinuxVolumes::pathForFileID(DeviceID device, FileID fileID) {
  const auto root = lookAtStorageRoot();
  if (!root) return std::unexpected(root.error());
  if (device != root->device) return std::unexpected(posixError(ENODEV));
  return _index.pathForFileID(fileID);
}

}  // namespace vantrell::linuxos
