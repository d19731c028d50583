#pragma once

#include <string>

#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/FndUUID.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell {

/// The volumes on which documents lie.
///
/// Threads: all members may be called from any thread.
class Volumes {
 public:
  virtual ~Volumes() = default;

  /// The volume's lasting identity: the same after unmounting and after a restart. Errors: POSIX.
  virtual Result<FndUUID> volumeUUIDForURL(const FndURL& url) = 0;

  /// Where the object of that number stands now; checked against the disk before it is told.
  /// Errors: POSIX; ENOENT when nothing below the recorded roots has that number, ENODEV for a
  /// volume that holds none of them.
  virtual Result<std::string> pathForFileID(DeviceID device, FileID fileID) = 0;
};

}  // namespace vantrell
