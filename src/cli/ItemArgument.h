#pragma once

#include <string>

#include "platform/dochost/DochostExtension.h"

namespace vantrell::cli {

/// The identifier that an argument stands for. `root`, `working-set` and `all-directories`, the
/// framework's own constants, and whatever begins with "did=", "fid=" or "#" are identifiers, and
/// are not looked at; anything else is a path, and must lead to an item.
/// Errors: 260 when nothing is at the path, InvalidArgument for a path outside the storage,
/// the framework's NoSuchItem for one that the extension shows no item for, POSIX.
Result<DochostItemIdentifier> identifierOfArgument(DochostExtension& extension,
                                                   const std::string& argument);

/// As `identifierOfArgument`, for an argument that is a path whatever it looks like.
Result<DochostItemIdentifier> identifierOfPath(DochostExtension& extension,
                                               const std::string& path);

}  // namespace vantrell::cli
