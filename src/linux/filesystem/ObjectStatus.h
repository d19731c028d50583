#pragma once

#include <sys/types.h>

#include <cstdint>
#include <optional>

#include "linux/catalog/FileIndex.h"
#include "linux/filesystem/Places.h"
#include "platform/foundation/FndDate.h"
#include "platform/foundation/Identifiers.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// What the kernel says of one object in one look.
struct ObjectStatus {
  FileKind kind = FileKind::RegularFile;
  FileID fileID;
  DeviceID device;
  mode_t permissions = 0;  ///< the twelve mode bits
  uid_t owner = 0;
  std::uint64_t linkCount = 0;
  std::uint64_t size = 0;  ///< bytes
  FndDate modified = FndDate::fromUnixTime(0);
  FndDate changed = FndDate::fromUnixTime(0);
  std::optional<FndDate> created;  ///< none on file systems that do not keep it
  bool isImmutable = false;
  bool isMountPoint = false;  ///< the root of a mounted volume, or of a bind mount

  bool isSameObjectAs(const ObjectStatus& other) const {
    return fileID == other.fileID && device == other.device;
  }
};

/// Looks at `name` in `folder`, or at `folder` itself with an empty name and AT_EMPTY_PATH.
/// `flags` are those of statx(2); a link is not followed. Never mounts anything.
OsResult<ObjectStatus> lookAt(int folder, const char* name, int flags = 0);

/// As `lookAt`, following a link at the end.
OsResult<ObjectStatus> lookThroughLinkAt(int folder, const char* name);

/// A volume's number as the kernel packs it into 32 bits: the minor number's low 8 bits, 12 bits
/// of the major number above them, and the rest of the minor number above those.
DeviceID deviceID(std::uint32_t major, std::uint32_t minor);

/// Nanoseconds since 1970; a date too far away becomes the furthest that fits.
std::int64_t nanosecondsSince1970(const FndDate& date);

/// What the catalog is told of an object seen at `path`.
SeenObject seenObject(std::string path, const ObjectStatus& status, bool isPackage);

/// True for what carries a document ID: regular files and packages.
inline bool isDocument(FileKind kind, bool isPackage) {
  return kind == FileKind::RegularFile || isPackage;
}

}  // namespace vantrell::linuxos
