#include "platform/dochost/DochostExtension.h"

#include "platform/dochost/DochostErrors.h"

namespace vantrell {
namespace {

FndError unsupported() {
  return FndError(kDochostErrorDomain,
                  static_cast<std::int64_t>(DochostErrorCode::FeatureUnsupported),
                  {{"message", std::any(std::string("This provider does not offer that."))}});
}

}  // namespace

DochostExtension::~DochostExtension() = default;

std::optional<FndURL> DochostExtension::_urlForItemWithPersistentIdentifier(std::string_view) {
  return std::nullopt;
}

std::optional<DochostItemIdentifier> DochostExtension::_persistentIdentifierForItemAt(
    const FndURL&) {
  return std::nullopt;
}

Result<DochostItemRef> DochostExtension::itemForIdentifier_error(std::string_view) {
  return std::unexpected(unsupported());
}

Result<std::shared_ptr<DochostEnumerator>>
DochostExtension::enumeratorForContainerItemIdentifier_error(std::string_view) {
  return std::unexpected(unsupported());
}

Result<void> DochostExtension::_listItemsInContainer_pageHandler(std::string_view,
                                                                 const PageHandler&) {
  return std::unexpected(unsupported());
}

void DochostExtension::providePlaceholderAtURL_completionHandler(const FndURL&,
                                                                 ErrorCompletion completion) {
  completion(unsupported());
}

void DochostExtension::startProvidingItemAtURL_completionHandler(const FndURL&,
                                                                 ErrorCompletion completion) {
  completion(unsupported());
}

void DochostExtension::itemChangedAtURL(const FndURL&) {}

void DochostExtension::stopProvidingItemAtURL(const FndURL&) {}

void DochostExtension::importDocumentAtURL_toParentItemIdentifier_completionHandler(
    const FndURL&, std::string_view, ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::createDirectoryWithName_inParentItemIdentifier_completionHandler(
    std::string_view, std::string_view, ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::renameItemWithIdentifier_toName_completionHandler(
    std::string_view, std::string_view, ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::
    reparentItemWithIdentifier_toParentItemWithIdentifier_newName_completionHandler(
        std::string_view, std::string_view, std::optional<std::string>, ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::deleteItemWithIdentifier_completionHandler(std::string_view,
                                                                  ErrorCompletion completion) {
  completion(unsupported());
}

void DochostExtension::trashItemWithIdentifier_completionHandler(std::string_view,
                                                                 ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::untrashItemWithIdentifier_toParentItemIdentifier_completionHandler(
    std::string_view, std::optional<std::string>, ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::_removeTrashedItemsOlderThanDate_completionHandler(
    FndDate, std::move_only_function<void()> completion) {
  completion();  // it has no way to report an error; nothing was removed
}

void DochostExtension::setLastUsedDate_forItemIdentifier_completionHandler(
    std::optional<FndDate>, std::string_view, ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::setTagData_forItemIdentifier_completionHandler(std::optional<FndData>,
                                                                      std::string_view,
                                                                      ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::setFavoriteRank_forItemIdentifier_completionHandler(
    std::optional<std::uint64_t>, std::string_view, ItemCompletion completion) {
  completion(nullptr, unsupported());
}

void DochostExtension::
    fetchThumbnailsForItemIdentifiers_requestedSize_perThumbnailCompletionHandler_completionHandler(
        const std::vector<DochostItemIdentifier>&, double, ThumbnailCompletion,
        ErrorCompletion completion) {
  completion(unsupported());
}

void DochostExtension::_refreshInstalledAppsWithCompletionHandler(ErrorCompletion completion) {
  completion(unsupported());
}

void DochostExtension::_defaultApplicationContainerForBundleIdentifier_completionHandler(
    std::string_view, URLCompletion completion) {
  completion(std::nullopt, unsupported());
}

}  // namespace vantrell
