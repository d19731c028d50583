#pragma once

#include <functional>

#include "platform/filesystem/OpenFile.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// How a folder and an item stand to each other.
enum class DhURLRelationship : std::uint8_t { Contains = 0, Same = 1, Other = 2 };

/// The relationship of `folder` to `item`, told from their paths without a system call. Both must
/// be canonical; only a path with ".." in it is made so first.
DhURLRelationship dh_relationshipToItemAtURL(const FndURL& folder, const FndURL& item);

/// True for a directory that is no package. False for what cannot be looked at.
bool dh_isFolder(const FndURL& url);

/// Opens the item for writing, hands it to `work`, and closes it. Errors: those of opening
/// (POSIX), else those of `work`.
Result<void> dh_withReadWriteAccess(const FndURL& url,
                                    const std::function<Result<void>(OpenFile&)>& work);

}  // namespace vantrell
