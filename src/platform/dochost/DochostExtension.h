#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/dochost/DochostEnumerator.h"
#include "platform/dochost/DochostItem.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// What the host framework asks of a document provider. One object serves a process.
///
/// A request that an extension does not implement completes with FeatureUnsupported.
///
/// Threads: all members may be called from any thread, several at once. Completion handlers are
/// called exactly once, on any thread, before or after the request has returned.
/// Lifetime: keep the extension until every request has completed.
class DochostExtension {
 public:
  /// On failure of a metadata write the fresh item comes along with the error.
  using ItemCompletion =
      std::move_only_function<void(DochostItemRef item, std::optional<FndError> error)>;
  using ErrorCompletion = std::move_only_function<void(std::optional<FndError> error)>;
  using URLCompletion =
      std::move_only_function<void(std::optional<FndURL> url, std::optional<FndError> error)>;
  using ThumbnailCompletion = std::move_only_function<void(
      std::string_view itemIdentifier, std::optional<FndData> png, std::optional<FndError> error)>;
  /// Takes the items of one page; false ends the listing.
  using PageHandler = std::function<bool(std::vector<DochostItemRef> items)>;

  virtual ~DochostExtension();

  // Lookups.
  virtual std::optional<FndURL> _urlForItemWithPersistentIdentifier(std::string_view identifier);
  /// `url` must be canonical (`FileSystem::canonicalURL`).
  virtual std::optional<DochostItemIdentifier> _persistentIdentifierForItemAt(const FndURL& url);
  virtual Result<DochostItemRef> itemForIdentifier_error(std::string_view identifier);
  virtual Result<std::shared_ptr<DochostEnumerator>> enumeratorForContainerItemIdentifier_error(
      std::string_view identifier);
  /// Lists what is directly in a folder, page by page, in the order of the disk.
  virtual Result<void> _listItemsInContainer_pageHandler(std::string_view identifier,
                                                         const PageHandler& handler);

  // Providing.
  virtual void providePlaceholderAtURL_completionHandler(const FndURL& url,
                                                         ErrorCompletion completion);
  virtual void startProvidingItemAtURL_completionHandler(const FndURL& url,
                                                         ErrorCompletion completion);
  virtual void itemChangedAtURL(const FndURL& url);
  virtual void stopProvidingItemAtURL(const FndURL& url);

  // Actions.
  virtual void importDocumentAtURL_toParentItemIdentifier_completionHandler(
      const FndURL& source, std::string_view parentIdentifier, ItemCompletion completion);
  virtual void createDirectoryWithName_inParentItemIdentifier_completionHandler(
      std::string_view name, std::string_view parentIdentifier, ItemCompletion completion);
  virtual void renameItemWithIdentifier_toName_completionHandler(std::string_view identifier,
                                                                 std::string_view name,
                                                                 ItemCompletion completion);
  virtual void reparentItemWithIdentifier_toParentItemWithIdentifier_newName_completionHandler(
      std::string_view identifier, std::string_view parentIdentifier,
      std::optional<std::string> newName, ItemCompletion completion);
  virtual void deleteItemWithIdentifier_completionHandler(std::string_view identifier,
                                                          ErrorCompletion completion);
  virtual void trashItemWithIdentifier_completionHandler(std::string_view identifier,
                                                         ItemCompletion completion);
  virtual void untrashItemWithIdentifier_toParentItemIdentifier_completionHandler(
      std::string_view identifier, std::optional<std::string> parentIdentifier,
      ItemCompletion completion);
  virtual void _removeTrashedItemsOlderThanDate_completionHandler(
      FndDate date, std::move_only_function<void()> completion);

  // Metadata.
  virtual void setLastUsedDate_forItemIdentifier_completionHandler(std::optional<FndDate> date,
                                                                   std::string_view identifier,
                                                                   ItemCompletion completion);
  virtual void setTagData_forItemIdentifier_completionHandler(std::optional<FndData> tagData,
                                                              std::string_view identifier,
                                                              ItemCompletion completion);
  virtual void setFavoriteRank_forItemIdentifier_completionHandler(
      std::optional<std::uint64_t> rank, std::string_view identifier, ItemCompletion completion);

  // Applications.
  virtual void
  fetchThumbnailsForItemIdentifiers_requestedSize_perThumbnailCompletionHandler_completionHandler(
      const std::vector<DochostItemIdentifier>& identifiers, double requestedSize,
      ThumbnailCompletion perThumbnail, ErrorCompletion completion);
  virtual void _refreshInstalledAppsWithCompletionHandler(ErrorCompletion completion);
  virtual void _defaultApplicationContainerForBundleIdentifier_completionHandler(
      std::string_view bundleIdentifier, URLCompletion completion);
};

}  // namespace vantrell
