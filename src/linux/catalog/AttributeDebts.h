#pragma once

#include <vector>

#include "linux/catalog/EntryTable.h"
#include "linux/catalog/FolderReader.h"
#include "linux/catalog/Schema.h"
#include "linux/catalog/Store.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// Gives the kept attributes of each document that owes them to the file that it goes on with,
/// but for those which that file has already. Where that cannot be done now, the document goes on
/// owing them. Errors: POSIX, the database's.
Result<void> payAttributeDebts(Store& store, const std::vector<RootRecord>& roots,
                               const FolderRules& rules, const LogLine& log);

}  // namespace vantrell::linuxos::catalog
