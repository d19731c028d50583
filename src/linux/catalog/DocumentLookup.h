#pragma once

#include <optional>
#include <span>
#include <string_view>
#include <vector>

#include "linux/catalog/FileIndex.h"
#include "linux/catalog/KnownFolder.h"
#include "linux/catalog/Store.h"
#include "linux/catalog/View.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// Which documents objects stand for, with new IDs for those that have none.
///
/// Errors: POSIX, the database's.
/// Threads: as the store. Lifetime: borrows the store and the view.
class DocumentLookup {
 public:
  DocumentLookup(Store& store, const View& view)
      : _store(store), _view(view), _reader(*store.database) {}

  /// The IDs in order; 0 for an object that is gone by now or lies on another volume.
  Result<std::vector<DocumentID>> idsOf(FileID folder, std::span<const SeenObject> objects);
  /// The ID of the living document that the object stands for, or 0.
  Result<DocumentID> existingIDOf(const SeenObject& object);

  /// Forgets what it has in memory; to be called whenever the catalog has changed.
  void forget() { _known.reset(); }

 private:
  /// An object and what was found out about it.
  struct Asked {
    const SeenObject& seen;
    std::optional<ObjectID> object;  // none while, or because, nobody knows which one it is
    Home home;                       // where a new document of it would be at home
    std::optional<Entry> refreshed;  // what its row should say, when that proves nothing any more
    DocumentID documentID;
  };

  Result<void> load(FileID folder);
  Result<bool> answerFromMemory(FileID folder, std::span<const SeenObject> objects,
                                std::vector<DocumentID>& ids);
  /// False when something is not where the catalog has it.
  Result<bool> identify(FileID folder, Asked& asked);
  Result<bool> identifyCatalogued(FileID folder, Asked& asked);
  void identifyOutOfView(Asked& asked);
  Result<void> settle(FileID folder, std::span<Asked> asked);
  Result<void> settleOne(FileID folder, Asked& asked);
  Result<void> refresh(FileID folder, const Asked& asked);
  Result<DocumentID> allocate(const Asked& asked);
  Result<std::vector<DocumentID>> lookUp(FileID folder, std::span<const SeenObject> objects);

  Store& _store;
  const View& _view;
  KnownFolderReader _reader;
  std::optional<KnownFolder> _known;  // of the folder asked about last
  std::int64_t _dataVersion = -1;     // changes when another process has written
};

}  // namespace vantrell::linuxos::catalog
