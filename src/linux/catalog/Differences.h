#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "linux/catalog/Comparison.h"
#include "linux/catalog/Database.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// How many names differ, by what became of them.
struct DifferenceCounts {
  std::uint64_t created = 0;
  std::uint64_t gone = 0;
  std::uint64_t moved = 0;
  std::uint64_t replaced = 0;
};

/// A directory that left a place, or came to one, in the course of a look.
struct MovedFolder {
  std::int64_t number = 0;  ///< in the order in which the differences were found
  ObjectID object;
};

/// Which object stood under which name before the running look, and which stands there now, for
/// each name where that differs. Kept in a temporary table, so that a look at a tree where
/// everything moved needs no more memory than any other.
///
/// Errors of all members: POSIX, the database's, translated.
/// Threads: as its database. Lifetime: borrows the database.
class Differences {
 public:
  explicit Differences(Database& database) : _database(database) {}

  /// Makes the table when it is not there, and empties it.
  Result<void> begin();

  Result<void> record(FileID parent, std::string_view name, const Entry* before,
                      const Entry* after);

  /// Takes every entry of a folder that is no more out of the catalog, and records it as gone.
  /// `isRecycled` says that another folder has the number by now: the names of the new one are
  /// none of the old one's.
  Result<void> removeEntriesOfFolder(FileID folder, bool isRecycled);

  /// The first directory that left a place after the difference `number`.
  Result<std::optional<MovedFolder>> nextLeftFolder(std::int64_t number);
  /// The first directory that came to a place after the difference `number`.
  Result<std::optional<MovedFolder>> nextAppearedFolder(std::int64_t number);

  Result<DifferenceCounts> counts();

 private:
  Result<std::optional<MovedFolder>> nextFolder(Statement& statement, std::int64_t number);

  Database& _database;
  Statement _record{_database,
                    "INSERT INTO temp.differences(parent, name, oldFileID, oldGeneration, oldKind, "
                    "newFileID, newGeneration, newKind, isRecycled) "
                    "VALUES (?1, ?2, ?3, ?4, ?5, ?6, ?7, ?8, 0)"};
  Statement _recordFolder{
      _database,
      "INSERT INTO temp.differences(parent, name, oldFileID, oldGeneration, oldKind, newFileID, "
      "newGeneration, newKind, isRecycled) "
      "SELECT parent, name, fileID, generation, kind, 0, 0, 0, ?2 FROM main.entries "
      "WHERE parent = ?1"};
  Statement _removeFolder{_database, "DELETE FROM main.entries WHERE parent = ?1"};
  Statement _nextLeftFolder{_database,
                            "SELECT number, oldFileID, oldGeneration FROM temp.differences "
                            "WHERE number > ?1 AND oldFileID <> 0 AND (oldKind & 15) = 1 "
                            "ORDER BY number LIMIT 1"};
  Statement _nextAppearedFolder{_database,
                                "SELECT number, newFileID, newGeneration FROM temp.differences "
                                "WHERE number > ?1 AND newFileID <> 0 AND (newKind & 15) = 1 "
                                "ORDER BY number LIMIT 1"};
};

}  // namespace vantrell::linuxos::catalog
