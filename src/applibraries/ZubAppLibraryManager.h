#pragma once

#include <vector>

#include "platform/foundation/FndURL.h"

namespace vantrell {

/// What the rest of the extension asks about app libraries.
///
/// Threads: any.
class ZubAppLibraryManager {
 public:
  ZubAppLibraryManager() = delete;

  /// The root folders of all app libraries that the shared manager holds.
  static std::vector<FndURL> rootURLsForAppLibraries();
};

}  // namespace vantrell
