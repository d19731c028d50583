#pragma once

#include <optional>
#include <string>

#include "linux/catalog/Comparison.h"
#include "linux/catalog/Database.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// An object out of view, and where it stood when its file ID was told.
struct SeenPlace {
  std::uint64_t generation = 0;
  std::string path;
};

/// Where objects that are not catalogued were seen.
///
/// Errors of all members: POSIX, the database's, translated.
/// Threads: as its database. Lifetime: borrows the database.
class SeenTable {
 public:
  explicit SeenTable(Database& database) : _database(database) {}

  Result<std::optional<SeenPlace>> place(FileID fileID);
  Result<void> put(const ObjectID& object, const std::string& path);

 private:
  Database& _database;
  Statement _place{_database, "SELECT generation, path FROM seen WHERE fileID = ?1"};
  Statement _put{_database, "INSERT OR REPLACE INTO seen VALUES (?1, ?2, ?3)"};
};

}  // namespace vantrell::linuxos::catalog
