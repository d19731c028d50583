#include "linux/filesystem/LinuxOpenFile.h"

#include <fcntl.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>
#include <utility>

#include "linux/PosixError.h"
#include "linux/filesystem/AttributeNames.h"

namespace vantrell::linuxos {

LinuxOpenFile::LinuxOpenFile(FileDescriptor descriptor, std::string path, OpenMode mode,
                             FileIndex& index, const TypeRegistry& types)
    : _descriptor(std::move(descriptor)),
      _path(std::move(path)),
      _mode(mode),
      _index(index),
      _types(types) {}

Result<std::unique_ptr<LinuxOpenFile>> LinuxOpenFile::open(std::string path, OpenMode mode,
                                                           FileIndex& index,
                                                           const TypeRegistry& types) {
  auto descriptor = openWithoutLinks(AT_FDCWD, path, O_PATH | O_NOFOLLOW);
  if (!descriptor) return std::unexpected(posixError(descriptor.error()));
  if (mode == OpenMode::ReadWrite) {
    const int refused = ::faccessat(descriptor->get(), "", W_OK, AT_EACCESS | AT_EMPTY_PATH);
    const int osError = errno;
    if (refused != 0) return std::unexpected(posixError(osError));
  }
  return std::unique_ptr<LinuxOpenFile>(
      new LinuxOpenFile(std::move(*descriptor), std::move(path), mode, index, types));
}

Result<ObjectStatus> LinuxOpenFile::look() const {
  auto status = lookAt(_descriptor.get(), "", AT_EMPTY_PATH);
  if (!status) return std::unexpected(posixError(status.error()));
  return *std::move(status);
}

bool LinuxOpenFile::isPackage(const ObjectStatus& status) const {
  if (status.kind != FileKind::Directory) return false;
  const std::string_view name = std::string_view(_path).substr(_path.rfind('/') + 1);
  return _types.typeConformsTo(_types.typeIdentifierForName(name, status.kind),
                               kPackageTypeIdentifier);
}

Result<DeviceID> LinuxOpenFile::deviceID() {
  auto status = look();
  if (!status) return std::unexpected(std::move(status.error()));
  return status->device;
}

Result<FileIdentity> LinuxOpenFile::identity() {
  auto status = look();
  if (!status) return std::unexpected(std::move(status.error()));
  FileIdentity identity{.kind = status->kind, .documentID = {}, .fileID = status->fileID};
  const SeenObject object = seenObject(_path, *status, isPackage(*status));
  _index.noteSeen(object);
  if (isDocument(object.kind, object.isPackage)) {
    identity.documentID = _index.documentIDOfObject(object);
  }
  return identity;
}

Result<SeenObject> LinuxOpenFile::seen() {
  auto mine = look();
  if (!mine) return std::unexpected(std::move(mine.error()));
  const auto place = placeOf(_path);
  if (!place) return std::unexpected(posixError(place.error()));
  const auto there = lookAt(place->folder.get(), place->name.data());
  if (!there) return std::unexpected(posixError(there.error()));
  if (!there->isSameObjectAs(*mine)) return std::unexpected(posixError(ESTALE));
  return seenObject(_path, *mine, isPackage(*mine));
}

// The descriptor itself takes no attributes; the kernel's link to it does, and leads to the very
// object, a symbolic link included.
Result<std::string> LinuxOpenFile::pathForWriting() const {
  if (_mode != OpenMode::ReadWrite) return std::unexpected(posixError(EACCES));
  return "/proc/self/fd/" + std::to_string(_descriptor.get());
}

Result<void> LinuxOpenFile::setAttribute(std::string_view name, FndDataView value) {
  const auto path = pathForWriting();
  if (!path) return std::unexpected(path.error());
  const auto fullName = linuxAttributeName(name);
  if (!fullName) return std::unexpected(posixError(EINVAL));
  const int failed = ::setxattr(path->c_str(), fullName->c_str(), value.data(), value.size(), 0);
  const int osError = errno;
  if (failed != 0) return std::unexpected(posixError(osError));
  noteAttribute(name, value);
  return {};
}

Result<void> LinuxOpenFile::removeAttribute(std::string_view name) {
  const auto path = pathForWriting();
  if (!path) return std::unexpected(path.error());
  const auto fullName = linuxAttributeName(name);
  if (!fullName) return std::unexpected(posixError(EINVAL));
  const int failed = ::removexattr(path->c_str(), fullName->c_str());
  const int osError = errno;
  if (failed != 0) return std::unexpected(posixError(osError));
  noteAttribute(name, std::nullopt);
  return {};
}

void LinuxOpenFile::noteAttribute(std::string_view name, std::optional<FndDataView> value) {
  if (const auto status = look()) _index.noteAttribute(status->fileID, name, value);
}

}  // namespace vantrell::linuxos
