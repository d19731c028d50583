#include "applibraries/ZubAppLibraryManager.h"

#include "applibraries/LocalAppLibraryManager.h"

namespace vantrell {

std::shared_ptr<const std::vector<FndURL>> ZubAppLibraryManager::rootURLsForAppLibraries() {
  return LocalAppLibraryManager::sharedManager().rootURLs();
}

}  // namespace vantrell
