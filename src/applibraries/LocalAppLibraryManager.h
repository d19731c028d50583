#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "items/LocalAppLibraryItem.h"
#include "platform/appreg/Appreg.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/SerialQueue.h"

namespace vantrell {

/// The app libraries: one for each application whose documents are shown.
///
/// Threads: all members may be called from any thread, not on the manager's own queue.
/// Lifetime: the shared one goes with the installed services.
class LocalAppLibraryManager {
 public:
  using AppLibraries =
      std::map<DochostItemIdentifier, std::shared_ptr<const LocalAppLibraryItem>, std::less<>>;
  using BundleProxies = std::map<FndURL, Appreg::BundleProxy>;
  using Records = std::vector<Appreg::BundleProxy>;

  /// Holds what the registry knows now.
  LocalAppLibraryManager();

  static LocalAppLibraryManager& sharedManager();

  /// The records of the applications that get a folder, in the registry's order. None on a
  /// machine without a registry.
  static Records retrieveAppLibraries();

  // The maps are replaced, never changed: a caller may walk the one it got at its leisure.
  std::shared_ptr<const AppLibraries> appLibrariesByItemIDs() const;
  std::shared_ptr<const BundleProxies> bundleProxiesByRootURLs() const;
  /// The keys of `bundleProxiesByRootURLs`, in their order.
  std::shared_ptr<const std::vector<FndURL>> rootURLs() const;

  /// The bundle identifier of the first library whose root contains `url`.
  std::optional<std::string> bundleIdentifierOfLibraryContaining(const FndURL& url) const;

 private:
  void buildMaps(const Records& records);

  SerialQueue _queue{"vantrell.app-library-manager"};
  std::shared_ptr<const AppLibraries> _appLibrariesByItemIDs;     // touched on _queue
  std::shared_ptr<const BundleProxies> _bundleProxiesByRootURLs;  // touched on _queue
  std::shared_ptr<const std::vector<FndURL>> _rootURLs;           // touched on _queue
};

}  // namespace vantrell
