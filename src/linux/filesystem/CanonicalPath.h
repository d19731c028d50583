#pragma once

#include <string>

#include "linux/filesystem/Places.h"

namespace vantrell::linuxos {

/// The same place without "..", and without links in the folders that lead to it; a link at the
/// end stays, and what stands at the end need not exist. `path` is absolute.
OsResult<std::string> canonicalPath(const std::string& path);

}  // namespace vantrell::linuxos
