#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "platform/dochost/DochostItem.h"
#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"

namespace vantrell {

/// Receives the items of one enumeration request. It ends with exactly one of the finish calls.
class DochostEnumerationObserver {
 public:
  virtual ~DochostEnumerationObserver() = default;
  virtual void didEnumerateItems(std::vector<DochostItemRef> items) = 0;
  /// `nextPage` is absent when there are no more pages.
  virtual void finishEnumeratingUpToPage(std::optional<FndData> nextPage) = 0;
  virtual void finishEnumeratingWithError(FndError error) = 0;
};

/// Receives the changes of one request. It ends with exactly one of the finish calls.
class DochostChangeObserver {
 public:
  virtual ~DochostChangeObserver() = default;
  virtual void didUpdateItems(std::vector<DochostItemRef> items) = 0;
  virtual void didDeleteItemsWithIdentifiers(std::vector<DochostItemIdentifier> identifiers) = 0;
  virtual void finishEnumeratingChangesUpToSyncAnchor_moreComing(FndData anchor,
                                                                 bool moreComing) = 0;
  virtual void finishEnumeratingWithError(FndError error) = 0;
};

/// Lists one container and tells what changed in it.
///
/// Threads: all members may be called from any thread; observers are called from any thread.
class DochostEnumerator {
 public:
  // Shared: the extension keeps an observer until its request is finished.
  using EnumerationObserver = std::shared_ptr<DochostEnumerationObserver>;
  using ChangeObserver = std::shared_ptr<DochostChangeObserver>;
  using AnchorCompletion = std::move_only_function<void(std::optional<FndData>)>;

  virtual ~DochostEnumerator() = default;
  virtual void enumerateItemsForObserver_startingAtPage(EnumerationObserver observer,
                                                        FndData page) = 0;
  virtual void enumerateChangesForObserver_fromSyncAnchor(ChangeObserver observer,
                                                          FndData anchor) = 0;
  virtual void currentSyncAnchorWithCompletionHandler(AnchorCompletion completion) = 0;
  virtual void invalidate() = 0;
};

}  // namespace vantrell
