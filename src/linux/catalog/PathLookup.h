#pragma once

#include <optional>
#include <string>

#include "linux/catalog/FileIndex.h"
#include "linux/catalog/Store.h"
#include "linux/catalog/View.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// Where objects and documents are, each answer checked on the disk.
///
/// Threads: as the store. Lifetime: borrows the store and the view.
class PathLookup {
 public:
  PathLookup(Store& store, const View& view) : _store(store), _view(view) {}

  /// Errors: POSIX; ENOENT when nothing known has the number.
  Result<std::string> pathForFileID(FileID fileID);
  /// Errors: POSIX; ENOENT when the document is gone or unknown.
  Result<FileID> fileIDOfDocument(DocumentID documentID);
  /// Errors: POSIX, the database's.
  Result<void> noteSeen(const SeenObject& object);

 private:
  /// None when what is catalogued is not what the disk shows.
  Result<std::optional<std::string>> cataloguedPath(FileID fileID);
  Result<std::optional<std::string>> seenPath(FileID fileID);
  Result<bool> isAtHome(const Document& document);
  bool stands(const std::string& path, const ObjectID& object) const;

  Store& _store;
  const View& _view;
};

}  // namespace vantrell::linuxos::catalog
