#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "linux/catalog/DocumentTable.h"
#include "linux/catalog/EntryTable.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// What the catalog says of one name, as far as it can be trusted without asking the disk.
struct KnownEntry {
  std::uint64_t nameHash = 0;
  ObjectID object;
  std::int64_t changedNanoseconds = 0;  ///< ctime, since 1970
  DocumentID documentID;                ///< 0 when no document has its home here
};

/// The documents and files of one folder in memory, for those who ask for one after the other.
/// It is as good as the moment it was read in.
///
/// Threads: as its database.
class KnownFolder {
 public:
  /// Reads the folder; none when it holds too much to be kept in memory.
  static Result<std::optional<KnownFolder>> read(EntryTable& entries, DocumentTable& documents,
                                                 FileID folder);

  FileID fileID() const { return _fileID; }
  /// The entry of that name when the number and the ctime prove that the same object stands
  /// there; else null.
  const KnownEntry* find(std::string_view name, FileID fileID,
                         std::int64_t changedNanoseconds) const;

 private:
  explicit KnownFolder(FileID fileID) : _fileID(fileID) {}
  Result<void> readEntries(EntryTable& entries, const std::vector<Document>& documents);

  FileID _fileID;
  std::vector<KnownEntry> _entries;  // by file ID
};

}  // namespace vantrell::linuxos::catalog
