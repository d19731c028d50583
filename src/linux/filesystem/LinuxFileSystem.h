#pragma once

#include <optional>

#include "linux/catalog/FileIndex.h"
#include "platform/filesystem/FileSystem.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// Files and folders as the kernel has them. No path is ever walked through a symbolic link, and
/// nothing waits for a FIFO's writer or a device.
///
/// Threads: all members may be called from any thread.
/// Lifetime: borrows the index and the types, which must outlive it and what it gives out.
class LinuxFileSystem : public FileSystem {
 public:
  /// Objects outside `storageDevice`, if given, get no file ID: identifiers carry no device.
  LinuxFileSystem(FileIndex& index, const TypeRegistry& types,
                  std::optional<DeviceID> storageDevice = std::nullopt);

  Result<void> readResourceValues(const FndURL& url,
                                  std::span<const FndURLResourceKey> keys) override;
  Result<std::unique_ptr<OpenFile>> open(const FndURL& url, OpenMode mode) override;
  Result<FileStatus> status(const FndURL& url) override;
  Result<std::unique_ptr<DirectoryEnumerator>> enumerateDirectory(
      const FndURL& folder, std::span<const FndURLResourceKey> prefetchedKeys, std::uint8_t options,
      DirectoryErrorHandler errorHandler) override;
  Result<void> createDirectory(const FndURL& url) override;
  Result<std::uint64_t> recursiveSizeOfDirectory(const FndURL& url) override;
  Result<FndURL> canonicalURL(const FndURL& url) override;

 private:
  FileIndex& _index;
  const TypeRegistry& _types;
  const std::optional<DeviceID> _storageDevice;
};

}  // namespace vantrell::linuxos
