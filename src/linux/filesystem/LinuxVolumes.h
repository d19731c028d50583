#pragma once

#include <string>

#include "linux/catalog/FileIndex.h"
#include "linux/filesystem/ObjectStatus.h"
#include "platform/filesystem/Volumes.h"

namespace vantrell::linuxos {

/// The volume that holds the storage, and what other volumes say of themselves.
///
/// A volume's identity is the file system's own when it has one. Only where it has none is one
/// made, once, and kept in an attribute of the storage root:
///
///     user.com.quillon.vantrell.volume-uuid = "<UUID> <file ID of the root>"
///
/// The file ID binds it to this very folder: a copy of the folder on another volume, attributes
/// and all, must not pass for the original, because its file IDs mean other files.
///
/// Threads: all members may be called from any thread.
/// Lifetime: borrows the index, which must outlive it.
class LinuxVolumes : public Volumes {
 public:
  /// `storageRoot` is a canonical path.
  LinuxVolumes(FileIndex& index, std::string storageRoot);

  Result<FndUUID> volumeUUIDForURL(const FndURL& url) override;
  Result<std::string> pathForFileID(DeviceID device, FileID fileID) override;

 private:
  Result<ObjectStatus> lookAtStorageRoot() const;

  FileIndex& _index;
  const std::string _storageRoot;
};

}  // namespace vantrell::linuxos
