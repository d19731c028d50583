#pragma once

#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "platform/dochost/DochostManager.h"

namespace vantrell {

/// A host that notes what the extension asks of it, and answers at once.
///
/// Threads: any.
class FakeManager : public DochostManager {
 public:
  explicit FakeManager(std::string_view storageRoot)
      : _documentStorageURL(FndURL::fileURLWithPath(storageRoot)) {}

  const FndURL& documentStorageURL() const override { return _documentStorageURL; }

  void signalEnumeratorForContainerItemIdentifier(std::string_view containerIdentifier,
                                                  Completion completion) override {
    {
      const std::lock_guard lock(_mutex);
      _signalled.emplace_back(containerIdentifier);
    }
    completion(_failure);
  }

  void deleteSearchableItemsWithDomainIdentifiers(std::vector<std::string> domainIdentifiers,
                                                  Completion completion) override {
    {
      const std::lock_guard lock(_mutex);
      _deletedDomains.insert(_deletedDomains.end(), domainIdentifiers.begin(),
                             domainIdentifiers.end());
    }
    completion(_failure);
  }

  /// Answers every request with this error. Set it before requests come.
  void failWith(FndError error) { _failure = std::move(error); }

  std::vector<std::string> signalledContainers() const {
    const std::lock_guard lock(_mutex);
    return _signalled;
  }
  std::vector<std::string> deletedDomains() const {
    const std::lock_guard lock(_mutex);
    return _deletedDomains;
  }

 private:
  const FndURL _documentStorageURL;
  std::optional<FndError> _failure;
  mutable std::mutex _mutex;
  std::vector<std::string> _signalled;       // guarded by _mutex
  std::vector<std::string> _deletedDomains;  // guarded by _mutex
};

}  // namespace vantrell
