#pragma once

#include <string>
#include <string_view>

namespace vantrell::linuxos {

/// The type of the file system that holds `path` ("ext4"), by a text in the format of
/// /proc/self/mountinfo. Empty when no line of it matches.
std::string fileSystemTypeInMountTable(std::string_view mountTable, std::string_view path);

/// The same by this process's own mount table. `path` must be canonical.
std::string fileSystemTypeOfPath(std::string_view path);

}  // namespace vantrell::linuxos
