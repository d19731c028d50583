#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "linux/catalog/Comparison.h"
#include "linux/catalog/Database.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

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
  FileID fileID() const { return _fileID; }
  /// The entry of that name when the number and the ctime prove that the same object stands
  /// there; else null.
  const KnownEntry* find(std::string_view name, FileID fileID,
                         std::int64_t changedNanoseconds) const;

 private:
  friend class KnownFolderReader;
  explicit KnownFolder(FileID fileID) : _fileID(fileID) {}

  FileID _fileID;
  std::vector<KnownEntry> _entries;  // by file ID
};

/// Reads folders into memory, in one pass over their entries and documents.
///
/// Errors: POSIX, the database's.
/// Threads: as its database. Lifetime: borrows the database.
class KnownFolderReader {
 public:
  explicit KnownFolderReader(Database& database) : _database(database) {}

  /// None for a folder that is not catalogued, or that holds too much to be kept in memory.
  Result<std::optional<KnownFolder>> read(FileID folder);

 private:
  Result<void> readEntries(KnownFolder& folder);

  Database& _database;
  Statement _count{_database, "SELECT entryCount FROM folders WHERE fileID = ?1"};
  Statement _entries{_database,
                     "SELECT name, fileID, generation, kind, ctime FROM entries "
                     "WHERE parent = ?1 ORDER BY name"};
  Statement _documents{_database,
                       "SELECT homeName, fileID, documentID FROM documents "
                       "WHERE homeParent = ?1 AND isAlive = 1 ORDER BY homeName"};
};

}  // namespace vantrell::linuxos::catalog
