#pragma once

#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// The host framework's manager: what the extension may ask of the host.
///
/// Threads: all members may be called from any thread; completions come on any thread, once.
class DochostManager {
 public:
  using Completion = std::move_only_function<void(std::optional<FndError>)>;

  virtual ~DochostManager() = default;

  /// The shared storage folder, canonical. One URL object for the life of the manager.
  virtual const FndURL& documentStorageURL() const = 0;

  /// Asks the host to enumerate the changes of a container; many requests may become one.
  virtual void signalEnumeratorForContainerItemIdentifier(std::string_view containerIdentifier,
                                                          Completion completion) = 0;

  /// Takes everything of these domains out of the search index.
  virtual void deleteSearchableItemsWithDomainIdentifiers(
      std::vector<std::string> domainIdentifiers, Completion completion) = 0;
};

}  // namespace vantrell
