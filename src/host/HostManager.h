#pragma once

#include <string_view>
#include <utility>

#include "platform/dochost/DochostManager.h"

namespace vantrell::host {

/// The manager of a host that serves one command: nobody holds an enumerator that could be
/// signalled, and no search index is kept, so both requests are done as soon as they are made.
///
/// Threads: all members may be called from any thread; completions come on the caller's.
class HostManager : public DochostManager {
 public:
  explicit HostManager(FndURL storageURL) : _storageURL(std::move(storageURL)) {}

  const FndURL& documentStorageURL() const override { return _storageURL; }

  void signalEnumeratorForContainerItemIdentifier(std::string_view,
                                                  Completion completion) override {
    if (completion) completion(std::nullopt);
  }

  void deleteSearchableItemsWithDomainIdentifiers(std::vector<std::string>,
                                                  Completion completion) override {
    if (completion) completion(std::nullopt);
  }

 private:
  const FndURL _storageURL;
};

}  // namespace vantrell::host
