#pragma once

#include <string_view>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell {

/// What the file system says of one object in one look.
struct FileIdentity {
  FileKind kind;
  DocumentID documentID;  ///< 0 while the object has none
  FileID fileID;
};

/// How an object is opened. None waits for a writer or a device, and none follows a link.
enum class OpenMode : std::uint8_t {
  EventOnly,  ///< to look at it: works on what may not be read, and is no opening of a document
  ReadOnly,   ///< its attributes cannot be set through this
  ReadWrite,  ///< fails at once when the caller may not write the object; good for folders too
};

/// One opened object, whatever its name is by now. Closed when destroyed.
///
/// Threads: use each from one thread at a time.
class OpenFile {
 public:
  virtual ~OpenFile() = default;

  /// The volume that holds the object. Errors: POSIX.
  virtual Result<DeviceID> deviceID() = 0;
  /// Kind, document ID and file ID together. Errors: POSIX.
  virtual Result<FileIdentity> identity() = 0;
  /// Creates or replaces an extended attribute. Errors: POSIX; EACCES when not opened for
  /// writing, EPERM on what cannot carry one (links, FIFOs), ENOSPC for one too large.
  virtual Result<void> setAttribute(std::string_view name, FndDataView value) = 0;
  /// Errors: POSIX; ENODATA when there is none of that name.
  virtual Result<void> removeAttribute(std::string_view name) = 0;
};

}  // namespace vantrell
