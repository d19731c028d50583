#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "linux/types/GlobTable.h"
#include "linux/types/StringMap.h"

namespace vantrell::linuxos {

/// What the files of the shared MIME databases say, the databases' own rules of precedence among
/// folders applied.
struct MimeDatabase {
  std::vector<GlobRule> globs;     ///< the most important first
  StringMap<std::string> aliases;  ///< to the type it stands for
  StringMap<std::vector<std::string>> supertypes;
};

/// Reads "globs2", "aliases" and "subclasses" of each folder, the most important folder first. A
/// file that is missing or damaged gives what can be made out of it.
///
///     globs2      weight:type:pattern[:flag,...]   a pattern "__NOGLOBS__" takes away what less
///                                                  important folders say of the type
///     aliases     alias type
///     subclasses  type supertype
MimeDatabase readMimeDatabase(const std::vector<std::string>& mimeFolders);

/// Calls `each` with every line of the file; what is missing has none. Lines longer than any that
/// makes sense are left out.
void forEachLine(const std::string& path, const std::function<void(std::string_view)>& each);

/// True for "text/plain" and the like: two names of the characters that types are written with.
bool isTypeName(std::string_view type);

}  // namespace vantrell::linuxos
