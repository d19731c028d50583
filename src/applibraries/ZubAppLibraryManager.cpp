#include "applibraries/ZubAppLibraryManager.h"

#include "applibraries/LocalAppLibraryManager.h"

namespace vantrell {

std::vector<FndURL> ZubAppLibraryManager::rootURLsForAppLibraries() {
  const auto proxies = LocalAppLibraryManager::sharedManager().bundleProxiesByRootURLs();
  std::vector<FndURL> roots;
  roots.reserve(proxies->size());
  for (const auto& [root, proxy] : *proxies) roots.push_back(root);
  return roots;
}

}  // namespace vantrell
