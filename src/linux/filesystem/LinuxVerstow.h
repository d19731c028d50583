#pragma once

#include <string>

#include "linux/catalog/FileIndex.h"
#include "linux/filesystem/ObjectStatus.h"
#include "platform/types/TypeRegistry.h"
#include "platform/verstow/VerstowManager.h"

namespace vantrell::linuxos {

/// Document IDs, as the documents table keeps them.
///
/// Threads: all members may be called from any thread.
/// Lifetime: borrows the index and the types, which must outlive it.
class LinuxVerstow : public VerstowManager {
 public:
  /// `storageRoot` is a canonical path; only documents on its volume can have IDs.
  LinuxVerstow(FileIndex& index, const TypeRegistry& types, std::string storageRoot);

  void prepare() override;
  Result<FileID> resolveDocumentID(DocumentID documentID, DeviceID device) override;
  /// Takes the files that `LinuxFileSystem` opens; EINVAL for another's. ENOENT or ESTALE when
  /// the path it was opened at leads to nothing or to something else by now.
  Result<DocumentID> getOrAllocateDocumentID(OpenFile& file) override;
  Result<DocumentID> permanentStorageAtURL(const FndURL& url, bool allocateIfNone) override;

 private:
  Result<DocumentID> documentID(const SeenObject& object, bool allocateIfNone);
  Result<void> checkDevice(DeviceID device, int osError) const;

  FileIndex& _index;
  const TypeRegistry& _types;
  const std::string _storageRoot;
};

}  // namespace vantrell::linuxos
