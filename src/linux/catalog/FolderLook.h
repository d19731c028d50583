#pragma once

#include <span>
#include <string>
#include <vector>

#include "linux/catalog/EntryTable.h"
#include "linux/catalog/FolderReader.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// Where differences were found.
struct FolderInHand {
  int descriptor;
  FileID fileID;
};

/// Takes the differences that a look finds, in the order in which it finds them.
class DifferenceSink {
 public:
  virtual ~DifferenceSink() = default;
  /// Errors: POSIX; they end the look.
  virtual Result<void> apply(const FolderInHand& folder,
                             std::span<const Difference> differences) = 0;
};

/// How the look at one folder ended.
struct FolderOutcome {
  int osError = 0;  ///< errno value of what kept it from being read to its end; 0 when nothing did
  std::uint64_t entryCount = 0;  ///< catalogued names in it, when it was read to its end
};

/// The comparison of one open folder, or of one name in it, with the catalog. This is what every
/// look consists of, whatever its reason.
///
/// Errors of the members: POSIX, the database's and the sink's. What the folder itself answers is
/// in the outcome.
/// Threads: as the database. Lifetime: borrows everything that it is given.
class FolderLook {
 public:
  FolderLook(EntryTable& entries, const FolderInHand& folder, const FolderRules& rules,
             DifferenceSink& sink);

  /// Compares all names. `folder` must stand at its beginning.
  Result<FolderOutcome> lookAtAll();
  /// Compares one name. The count is 1 when something that is catalogued stands there.
  Result<FolderOutcome> lookAtName(const std::string& name);

 private:
  Result<FolderOutcome> compareWhole(std::vector<Entry>& seen);
  Result<FolderOutcome> compareInPieces(std::vector<Entry> piece);
  Result<void> comparePiece(std::vector<Entry>& piece);
  Result<FolderOutcome> askForEachCatalogued();
  Result<void> compare(std::span<const Entry> catalogued, std::span<Entry> seen);

  EntryTable& _entries;
  FolderInHand _folder;
  FolderReader _reader;
  DifferenceSink& _sink;
};

}  // namespace vantrell::linuxos::catalog
