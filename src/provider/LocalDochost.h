#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "items/LocalItem.h"
#include "platform/archive/KeyedArchive.h"
#include "platform/dochost/DhPacer.h"
#include "platform/dochost/DochostExtension.h"
#include "platform/foundation/SerialQueue.h"

namespace vantrell {

/// The extension's principal class: the host framework creates one and sends it every request.
/// It finds out what a request is about, has the work done, and answers.
///
/// Threads: requests may come on any thread, several at once; completions run on the thread of
/// their request, those of an app refresh on its queue.
/// Lifetime: keep it until every request has completed. Once its destructor has returned,
/// nothing of it runs any more.
class LocalDochost final : public DochostExtension {
 public:
  /// Asks for an app refresh, and signals the working set to the host.
  LocalDochost();
  ~LocalDochost() override;

  std::optional<FndURL> _urlForItemWithPersistentIdentifier(std::string_view identifier) override;
  std::optional<DochostItemIdentifier> _persistentIdentifierForItemAt(const FndURL& url) override;
  Result<DochostItemRef> itemForIdentifier_error(std::string_view identifier) override;
  Result<std::shared_ptr<DochostEnumerator>> enumeratorForContainerItemIdentifier_error(
      std::string_view identifier) override;
  /// Pages of at most 200 items. Errors: no such item; POSIX: ENOTDIR for what is no folder,
  /// EACCES for one that may not be read; NotHereYet for the containers that span folders.
  Result<void> _listItemsInContainer_pageHandler(std::string_view identifier,
                                                 const PageHandler& handler) override;

  void providePlaceholderAtURL_completionHandler(const FndURL& url,
                                                 ErrorCompletion completion) override;
  void startProvidingItemAtURL_completionHandler(const FndURL& url,
                                                 ErrorCompletion completion) override;
  void itemChangedAtURL(const FndURL& url) override;
  void stopProvidingItemAtURL(const FndURL& url) override;

  void setLastUsedDate_forItemIdentifier_completionHandler(std::optional<FndDate> date,
                                                           std::string_view identifier,
                                                           ItemCompletion completion) override;
  void setTagData_forItemIdentifier_completionHandler(std::optional<FndData> tagData,
                                                      std::string_view identifier,
                                                      ItemCompletion completion) override;
  void setFavoriteRank_forItemIdentifier_completionHandler(std::optional<std::uint64_t> rank,
                                                           std::string_view identifier,
                                                           ItemCompletion completion) override;

  void _refreshInstalledAppsWithCompletionHandler(ErrorCompletion completion) override;

  /// The record of the item at `url`, for requests that end with one. Errors: no such item.
  Result<DochostItemRef> itemAtURL(const FndURL& url);

 private:
  using Completions = std::vector<ErrorCompletion>;

  static Result<FndURL> urlForItemIdentifier(std::string_view identifier);
  static void pacerEvent(Completions& waiting);
  void completeWithFreshItem(std::string_view identifier, std::optional<FndError> error,
                             ItemCompletion completion);

  // Shared with an event that is running on the queue.
  const std::shared_ptr<Completions> appRefreshCompletionHandlers;  // touched on the queue
  const SerialQueue appRefreshQueue;
  // Shared with requests that are on their way to the queue.
  std::shared_ptr<DhPacer> appRefreshPacer;
};

}  // namespace vantrell
