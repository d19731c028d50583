#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "linux/catalog/Database.h"
#include "platform/foundation/FndError.h"
#include "platform/log/LogSink.h"

namespace vantrell::linuxos::catalog {

/// The version of the tables that this program reads and writes.
inline constexpr std::uint32_t kSchemaVersion = 1;

/// Takes finished lines.
using LogLine = std::function<void(LogLevel, const std::string&)>;

/// A database that is ready to be used.
struct OpenedDatabase {
  std::unique_ptr<Database> database;
  bool isNew = false;
};

/// Opens the catalog's database, or makes it. One that is damaged is set aside under a name that
/// says so, never deleted, and a new one is made; an error line tells of it.
/// Errors: StateUnavailable, with what to do, for a database of another program or of a newer
/// version and for a folder or file that cannot be written: nothing has been touched then.
Result<OpenedDatabase> openDatabase(const std::string& path, const LogLine& log);

/// Gives the database, and the files that belong to it, a name that says it was damaged.
Result<void> setAsideDamaged(const std::string& path, const LogLine& log);

/// Makes the indexes that a first look is faster without, when they are not there.
Result<void> createIndexes(Database& database);

/// The error that says that the state folder or its database cannot be used.
FndError stateUnavailable(const std::string& message);

}  // namespace vantrell::linuxos::catalog
