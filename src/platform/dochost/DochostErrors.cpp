#include "platform/dochost/DochostErrors.h"

#include <utility>

namespace vantrell {
namespace {

FndError dochostError(DochostErrorCode code, FndError::UserInfo userInfo) {
  return FndError(kDochostErrorDomain, static_cast<std::int64_t>(code), std::move(userInfo));
}

std::any text(std::string value) { return std::any(std::move(value)); }

}  // namespace

DochostItem::~DochostItem() = default;

FndError dochostErrorForNonExistentItem(std::string_view itemIdentifier) {
  return dochostError(
      DochostErrorCode::NoSuchItem,
      {{std::string(kDochostErrorItemIdentifierKey), text(std::string(itemIdentifier))},
       {"message", text("There is no item \"" + std::string(itemIdentifier) + "\".")}});
}

FndError dochostErrorForCollisionWithItem(DochostItemRef item) {
  std::string message = "\"" + item->filename() + "\" already exists.";
  return dochostError(DochostErrorCode::ItemCollision,
                      {{std::string(kDochostErrorCollidingItemKey), std::any(std::move(item))},
                       {"message", text(std::move(message))}});
}

FndError dochostErrorSyncAnchorExpired() {
  return dochostError(DochostErrorCode::SyncAnchorExpired,
                      {{"message", text("The sync anchor has expired: list again.")}});
}

}  // namespace vantrell
