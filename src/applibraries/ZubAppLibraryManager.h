#pragma once

#include <memory>
#include <vector>

#include "platform/foundation/FndURL.h"

namespace vantrell {

/// What the rest of the extension asks about app libraries.
///
/// Threads: any.
class ZubAppLibraryManager {
 public:
  ZubAppLibraryManager() = delete;

  /// The root folders of all app libraries that the shared manager holds. Shared, because they
  /// are asked for with every item that is not in the storage.
  static std::shared_ptr<const std::vector<FndURL>> rootURLsForAppLibraries();
};

}  // namespace vantrell
