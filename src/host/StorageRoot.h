#pragma once

#include <optional>
#include <string>

#include "linux/system/XdgFolders.h"
#include "platform/foundation/FndError.h"

namespace vantrell::host {

/// The storage folder, canonical: `given` when there is one, else the user's documents folder.
/// Errors: a folder that is not there (260), is none (ENOTDIR) or cannot be read (EACCES), and
/// InvalidArgument when the user has no documents folder; each says what to do.
Result<std::string> storageRoot(const std::optional<std::string>& given,
                                const linuxos::XdgFolders& folders);

/// What the user should know of a storage folder that works, but not for everything; none when
/// there is nothing to say.
std::optional<std::string> storageRootWarning(const std::string& canonicalPath);

}  // namespace vantrell::host
