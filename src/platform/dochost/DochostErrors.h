#pragma once

#include <string_view>

#include "platform/dochost/DochostItem.h"
#include "platform/foundation/FndError.h"

namespace vantrell {

/// The codes of the host framework's domain.
enum class DochostErrorCode : std::int64_t {
  NoSuchItem = -1001,
  SyncAnchorExpired = -1002,
  ItemCollision = -1003,
  FeatureUnsupported = -1004,
};

/// The keys of the information in the framework's errors.
inline constexpr std::string_view kDochostErrorItemIdentifierKey = "itemIdentifier";
inline constexpr std::string_view kDochostErrorCollidingItemKey =
    "collidingItem";  // DochostItemRef
/// In the foundation's FileWriteFileExists: the `FndURL` of what stands in the way.
inline constexpr std::string_view kDhCollidingURLKey = "dh_collidingURL";

FndError dochostErrorForNonExistentItem(std::string_view itemIdentifier);
FndError dochostErrorForCollisionWithItem(DochostItemRef item);
FndError dochostErrorSyncAnchorExpired();

}  // namespace vantrell
