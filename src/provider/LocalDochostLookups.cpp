// Identifiers, URLs and items: the look-ups of the principal class.

#include <utility>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "identity/ItemForIdentifierString.h"
#include "identity/ZubFileObjectIdentifier.h"
#include "platform/dochost/DochostErrors.h"
#include "provider/LocalDochost.h"
#include "support/Log.h"
#include "support/TracedSection.h"

namespace vantrell {

Result<DochostItemRef> LocalDochost::itemForIdentifier_error(std::string_view identifier) {
  const TracedSection section("fetching item's properties for \"", identifier, "\"");
  auto item = itemForIdentifierString(identifier);
  if (item != nullptr) {
    logDebug("found ", *item);
    return item;
  }
  logError("item lookup failed for identifier \"", identifier, "\"");
  return std::unexpected(dochostErrorForNonExistentItem(identifier));
}

std::optional<FndURL> LocalDochost::_urlForItemWithPersistentIdentifier(
    std::string_view identifier) {
  const Result<FndURL> url = urlForItemIdentifier(identifier);
  return url ? std::optional(*url) : std::nullopt;
}

Result<FndURL> LocalDochost::urlForItemIdentifier(std::string_view identifier) {
  const TracedSection section("fetching URL for \"", identifier, "\"");
  if (const auto item = itemForIdentifierString(identifier)) {
    logDebug("found ", *item);
    return item->fileURL();
  }
  FndError error = dochostErrorForNonExistentItem(identifier);
  logError("can't find URL matching identifier ", identifier, "; ", error.code());
  return std::unexpected(std::move(error));
}

std::optional<DochostItemIdentifier> LocalDochost::_persistentIdentifierForItemAt(
    const FndURL& url) {
  const TracedSection section("fetching item identifier for \"", url, "\"");
  if (url.lastPathComponent() == "Documents") {
    if (auto identifier = ZubFileObjectIdentifier::fromAppLibraryDataContainerURL(url)) {
      return identifier;
    }
  }
  const auto item = LocalItem::init(url);
  if (item == nullptr) return std::nullopt;
  logDebug("found ", item->itemIdentifier());
  return item->itemIdentifier();
}

Result<DochostItemRef> LocalDochost::itemAtURL(const FndURL& url) {
  const auto identifier = _persistentIdentifierForItemAt(url);
  if (!identifier) {
    logError("identifier lookup failed for URL \"", url, "\"");
    return std::unexpected(dochostErrorForNonExistentItem(url.path()));
  }
  if (ZubFileObjectIdentifier::bundleIdentifierIn(*identifier)) {
    return itemForIdentifier_error(*identifier);
  }
  // The URL has been looked at: a new object reads afresh.
  auto item = *identifier == DochostTemporaryLocalFolderItemIdentifier
                  ? nullptr
                  : LocalItem::init(FndURL::fileURLWithPath(url.path()));
  if (item != nullptr) return item;
  logError("can't create item for URL \"", url, "\"");
  return std::unexpected(dochostErrorForNonExistentItem(*identifier));
}

Result<std::shared_ptr<DochostEnumerator>> LocalDochost::enumeratorForContainerItemIdentifier_error(
    std::string_view identifier) {
  const TracedSection section("enumerator for ", identifier);
  const bool spansFolders = identifier == DochostRootContainerItemIdentifier ||
                            identifier == DochostWorkingSetContainerItemIdentifier ||
                            identifier == DochostAllDirectoriesContainerItemIdentifier;
  if (!spansFolders) {
    const Result<FndURL> url = urlForItemIdentifier(identifier);
    if (!url) return std::unexpected(url.error());
  }
  return std::unexpected(FndError::vantrell(
      VantrellErrorCode::NotHereYet,
      "Enumerators with pages and changes are not here yet; a folder can be listed."));
}

}  // namespace vantrell
