#pragma once

#include <string_view>

namespace vantrell::linuxos::catalog {

/// The one hidden folder that is catalogued, where it belongs.
inline constexpr std::string_view kTrashFolderName = ".Trash";
/// A folder of that name may hold a trash folder, as every root may.
inline constexpr std::string_view kDocumentsFolderName = "Documents";

/// True for names that begin with ".".
inline bool isHiddenName(std::string_view name) { return name.starts_with('.'); }

/// True for the names that backups and temporary files have, hidden ones among them; the list is
/// in docs/guarantees.md.
bool isSetAsideName(std::string_view name);

}  // namespace vantrell::linuxos::catalog
