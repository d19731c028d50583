#pragma once

#include "platform/filesystem/OpenFile.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell {

/// The generational storage: which file stands for a document now. A document keeps its ID when
/// it is renamed, moved, or saved by replacing its file; an ID is never given to another one.
///
/// Threads: all members may be called from any thread.
class VerstowManager {
 public:
  virtual ~VerstowManager() = default;

  /// Makes the service ready; cheap when it is. Call before the others.
  virtual void prepare() = 0;

  /// The file that stands for the document now. Errors: POSIX; ENOENT for a document that is
  /// gone or was never there; EAGAIN, EBUSY and ESTALE may pass when asked again.
  virtual Result<FileID> resolveDocumentID(DocumentID documentID, DeviceID device) = 0;

  /// The ID of the document that `file` stands for, a new one when it has none. A new one is
  /// durable before it is told. Errors: POSIX; EXDEV for a file on another volume.
  virtual Result<DocumentID> getOrAllocateDocumentID(OpenFile& file) = 0;

  /// Makes the storage record which file stands for the document at `url` now; allocates an ID
  /// for one that has none only when `allocateIfNone`. Answers 0 when there is none.
  virtual Result<DocumentID> permanentStorageAtURL(const FndURL& url, bool allocateIfNone) = 0;
};

}  // namespace vantrell
