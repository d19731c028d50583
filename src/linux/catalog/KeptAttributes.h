#pragma once

#include <optional>
#include <string>
#include <vector>

#include "linux/catalog/DocumentTable.h"
#include "linux/filesystem/Places.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// Those attributes of `name` in the open folder `folder` that a document keeps when its file is
/// replaced. None when they cannot be read. A link is not followed.
std::optional<std::vector<Attribute>> readKeptAttributes(int folder, const std::string& name);

/// Sets, on the object that `descriptor` is open on (O_PATH will do), each of the attributes that
/// it has not. The error is that of the first one that could not be set.
OsResult<void> setMissingAttributes(int descriptor, const std::vector<Attribute>& attributes);

}  // namespace vantrell::linuxos::catalog
