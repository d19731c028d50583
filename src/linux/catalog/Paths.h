#pragma once

#include <optional>
#include <string>
#include <vector>

#include "linux/catalog/EntryTable.h"
#include "linux/filesystem/Places.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// The path of a name in a catalogued folder, as the catalog knows it; none when the way up does
/// not lead to one of the roots. Errors: POSIX, the database's.
Result<std::optional<std::string>> pathOf(EntryTable& entries, const std::vector<RootRecord>& roots,
                                          FileID parent, const std::string& name);

/// What stands at a path now, with its generation; a link is looked at, and none is followed on
/// the way.
struct StandingObject {
  FileDescriptor descriptor;  ///< opened with O_PATH
  Entry entry;                ///< without a name
  DeviceID device;
};

/// The error is that of the system call that failed.
OsResult<StandingObject> objectStandingAt(const std::string& path);

/// True when that object stands there now.
bool standsAt(const std::string& path, const ObjectID& object);

}  // namespace vantrell::linuxos::catalog
