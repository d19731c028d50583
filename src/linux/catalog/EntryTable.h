#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "linux/catalog/Comparison.h"
#include "linux/catalog/Database.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// An entry and the folder that holds it.
struct PlacedEntry {
  FileID parent;
  Entry entry;
};

/// What is remembered of a folder since it was last read.
struct FolderRecord {
  std::uint64_t generation = 0;
  std::int64_t changedNanoseconds = 0;  ///< its ctime before it was read; 0: read it again
  std::uint64_t entryCount = 0;
};

/// A place where the tree begins, and what stood there when it was last looked at.
struct RootRecord {
  std::string path;
  ObjectID object;
};

/// The catalogued entries, folders and roots in the database.
///
/// Errors of all members: POSIX, the database's, translated.
/// Threads: as its database. Lifetime: borrows the database.
class EntryTable {
 public:
  explicit EntryTable(Database& database) : _database(database) {}

  /// True when there is no entry at all.
  Result<bool> isEmpty();

  /// At most `limit` entries of the folder with a name greater than `after`, by name.
  Result<std::vector<Entry>> entriesOfFolder(FileID parent, std::string_view after,
                                             std::size_t limit);
  /// As `entriesOfFolder`, for directories alone.
  Result<std::vector<Entry>> subfolders(FileID parent, std::string_view after, std::size_t limit);
  Result<std::uint64_t> countOfFolder(FileID parent);
  Result<std::optional<Entry>> entry(FileID parent, std::string_view name);
  /// Every place where an object of that number is catalogued.
  Result<std::vector<PlacedEntry>> placesOfFileID(FileID fileID);
  Result<void> put(FileID parent, const Entry& entry);
  Result<void> remove(FileID parent, std::string_view name);

  Result<std::optional<FolderRecord>> folder(FileID fileID);
  Result<void> putFolder(FileID fileID, const FolderRecord& record);
  Result<void> removeFolder(FileID fileID);

  Result<std::vector<RootRecord>> roots();
  Result<void> putRoot(const RootRecord& root);
  Result<void> removeRoot(const std::string& path);

 private:
  Result<std::vector<Entry>> read(Statement& statement);

  Database& _database;
  Statement _entries{_database,
                     "SELECT name, fileID, generation, kind, size, mtime, ctime FROM entries "
                     "WHERE parent = ?1 AND name > ?2 ORDER BY name LIMIT ?3"};
  Statement _subfolders{_database,
                        "SELECT name, fileID, generation, kind, size, mtime, ctime FROM entries "
                        "WHERE parent = ?1 AND name > ?2 AND " VANTRELL_SQL_IS_DIRECTORY
                        " ORDER BY name LIMIT ?3"};
  Statement _entry{_database,
                   "SELECT name, fileID, generation, kind, size, mtime, ctime FROM entries "
                   "WHERE parent = ?1 AND name = ?2"};
  Statement _count{_database, "SELECT count(*) FROM entries WHERE parent = ?1"};
  Statement _places{_database,
                    "SELECT name, fileID, generation, kind, size, mtime, ctime, parent "
                    "FROM entries WHERE fileID = ?1 ORDER BY parent, name"};
  Statement _put{_database,
                 "INSERT OR REPLACE INTO entries(parent, name, fileID, generation, kind, size, "
                 "mtime, ctime) VALUES (?1, ?2, ?3, ?4, ?5, ?6, ?7, ?8)"};
  Statement _remove{_database, "DELETE FROM entries WHERE parent = ?1 AND name = ?2"};
  Statement _folder{_database,
                    "SELECT generation, ctime, entryCount FROM folders WHERE fileID = ?1"};
  Statement _putFolder{_database, "INSERT OR REPLACE INTO folders VALUES (?1, ?2, ?3, ?4)"};
  Statement _removeFolder{_database, "DELETE FROM folders WHERE fileID = ?1"};
  Statement _roots{_database, "SELECT path, fileID, generation FROM roots ORDER BY path"};
  Statement _putRoot{_database, "INSERT OR REPLACE INTO roots VALUES (?1, ?2, ?3)"};
  Statement _removeRoot{_database, "DELETE FROM roots WHERE path = ?1"};
};

}  // namespace vantrell::linuxos::catalog
