#pragma once

#include <memory>

#include "linux/catalog/FileIndex.h"
#include "linux/filesystem/Access.h"
#include "linux/filesystem/EntryInHand.h"
#include "linux/filesystem/TreeWalk.h"
#include "platform/filesystem/FileSystem.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// Lists what lies below a folder. One look at an entry gives all its values, and one question to
/// the index gives the document IDs of a whole piece of a folder, new ones included, so that they
/// become durable together.
///
/// Threads: use each from one thread at a time.
/// Lifetime: borrows the index and the types, which must outlive it.
class LinuxDirectoryEnumerator : public DirectoryEnumerator {
 public:
  struct Request {
    FndURL folder;
    std::uint8_t options = 0;  ///< bits of `DirectoryEnumerationOptions`
    bool wantsAccess = false;  ///< IsReadable and IsWritable, which may cost calls of their own
    DirectoryErrorHandler errorHandler;  ///< without one the first error ends the listing
  };

  /// `folder` is the request's, opened for reading.
  LinuxDirectoryEnumerator(FileDescriptor folder, Request request, FileIndex& index,
                           const TypeRegistry& types);
  LinuxDirectoryEnumerator(const LinuxDirectoryEnumerator&) = delete;
  LinuxDirectoryEnumerator& operator=(const LinuxDirectoryEnumerator&) = delete;

  std::optional<FndURL> next() override;

 private:
  void prepare(const WalkFolder& folder, std::span<WalkEntry> entries);
  void askForDocumentIDs(const WalkFolder& folder, std::span<WalkEntry> entries);
  void noteUncatalogued(const WalkFolder& folder, std::span<const WalkEntry> entries);
  bool handleError(const std::string& path, int osError);
  void rememberValues(const FndURL& url, const WalkEntry& entry, const WalkFolder& folder);

  Request _request;
  FileIndex& _index;
  const TypeRegistry& _types;
  FndURL _parent;  // of the entries given last: they share one URL object
  MountAccess _mount = MountAccess::Unknown;
  const uid_t _user;
  std::shared_ptr<const EntryInHand> _inHand;
  TreeWalk _walk;  // last: it calls back while it is being made
};

}  // namespace vantrell::linuxos
