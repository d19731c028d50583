#pragma once

#include <memory>
#include <optional>
#include <string>

#include "linux/FileDescriptor.h"
#include "linux/catalog/FileIndex.h"
#include "linux/filesystem/ObjectStatus.h"
#include "platform/filesystem/OpenFile.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// An object held by a descriptor that can neither read nor block (O_PATH). What it was opened
/// for is kept beside it, because Linux would let an attribute be set through any descriptor.
///
/// Threads: use each from one thread at a time.
/// Lifetime: borrows the index and the types, which must outlive it.
class LinuxOpenFile : public OpenFile {
 public:
  /// Errors: POSIX; for ReadWrite EACCES or EROFS when the caller may not write the object.
  static Result<std::unique_ptr<LinuxOpenFile>> open(std::string path, OpenMode mode,
                                                     FileIndex& index, const TypeRegistry& types);

  Result<DeviceID> deviceID() override;
  Result<FileIdentity> identity() override;
  Result<void> setAttribute(std::string_view name, FndDataView value) override;
  Result<void> removeAttribute(std::string_view name) override;

  /// The object as it is now, at the path it was opened at. Errors: POSIX; ENOENT when that path
  /// leads nowhere by now, ESTALE when it leads to another object.
  Result<SeenObject> seen();

 private:
  LinuxOpenFile(FileDescriptor descriptor, std::string path, OpenMode mode, FileIndex& index,
                const TypeRegistry& types);
  Result<ObjectStatus> look() const;
  Result<std::string> pathForWriting() const;
  bool isPackage(const ObjectStatus& status) const;
  void noteAttribute(std::string_view name, std::optional<FndDataView> value);

  FileDescriptor _descriptor;
  std::string _path;
  OpenMode _mode;
  FileIndex& _index;
  const TypeRegistry& _types;
};

}  // namespace vantrell::linuxos
