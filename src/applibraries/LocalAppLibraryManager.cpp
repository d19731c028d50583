#include "applibraries/LocalAppLibraryManager.h"

#include <array>
#include <utility>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "platform/Services.h"
#include "platform/dochost/DhURLOperations.h"
#include "support/Log.h"
#include "support/TracedSection.h"

namespace vantrell {
namespace {

constexpr std::string_view kSupportsDocumentBrowserKey = "XoSupportsDocumentBrowser";
/// The user's own applications, then the system's.
constexpr std::array kCategories = {0, 2};

// Which applications get a folder: those that say so themselves, and those that both open
// documents in place and share their files.
bool isSelected(const AppregApplicationProxy& application) {
  if (application.infoBoolean(kSupportsDocumentBrowserKey).value_or(false)) return true;
  return application.supportsOpenInPlace() && application.fileSharingEnabled();
}

void appendIfSelected(const Appreg::BundleProxy& proxy, LocalAppLibraryManager::Records& records) {
  if (proxy == nullptr) {
    logError("enumerate Application provided nil proxy");
    return;
  }
  const auto* application = dynamic_cast<const AppregApplicationProxy*>(proxy.get());
  if (application == nullptr || !application->dataContainerURL()) return;
  if (!isSelected(*application)) return;
  logDebug("add ", [&proxy] { return proxy->bundleIdentifier().value_or("<unknown>"); });
  records.push_back(proxy);
}

std::string listText(const LocalAppLibraryManager::Records& records) {
  std::string text = "[";
  for (const Appreg::BundleProxy& proxy : records) {
    if (text.size() > 1) text += ", ";
    text += proxy->description();
  }
  return text + "]";
}

// An identifier names no volume, so that a file ID of another one would be misread.
bool isOnStorageVolume(const FndURL& libraryRoot) {
  const Result<DeviceID> device = deviceIDWithError(libraryRoot);
  const DeviceID storage = deviceID(platform::services().manager->documentStorageURL());
  if (device && *device == storage) return true;
  logError("app library at ", libraryRoot, " is left out: it is not on the storage's volume");
  return false;
}

}  // namespace

LocalAppLibraryManager::LocalAppLibraryManager()
    : _appLibrariesByItemIDs(std::make_shared<AppLibraries>()),
      _bundleProxiesByRootURLs(std::make_shared<BundleProxies>()),
      _rootURLs(std::make_shared<std::vector<FndURL>>()) {
  buildMaps(retrieveAppLibraries());
}

LocalAppLibraryManager& LocalAppLibraryManager::sharedManager() {
  return platform::processWide<LocalAppLibraryManager>();
}

LocalAppLibraryManager::Records LocalAppLibraryManager::retrieveAppLibraries() {
  const TracedSection section("retrieving app libraries from appreg");
  Records records;
  Appreg* const appreg = platform::services().appreg;
  if (appreg == nullptr) return records;
  for (const int category : kCategories) {
    appreg->enumerateApplicationsOfCategory(category, [&records](const Appreg::BundleProxy& proxy) {
      appendIfSelected(proxy, records);
    });
  }
  logDebug("bundle proxies ", [&records] { return listText(records); });
  return records;
}

void LocalAppLibraryManager::buildMaps(const Records& records) {
  auto libraries = std::make_shared<AppLibraries>();
  auto proxies = std::make_shared<BundleProxies>();
  for (const Appreg::BundleProxy& proxy : records) {
    auto item = LocalAppLibraryItem::initWithBundleProxy(*proxy);
    if (item == nullptr) {
      logDebug("can't create app library from bundle proxy ", *proxy);
      continue;
    }
    if (!isOnStorageVolume(item->fileURL())) continue;
    (*proxies)[item->fileURL()] = proxy;
    (*libraries)[item->itemIdentifier()] = std::move(item);
  }
  auto roots = std::make_shared<std::vector<FndURL>>();
  for (const auto& [root, proxy] : *proxies) roots->push_back(root);
  _queue.sync([&] {
    _appLibrariesByItemIDs = std::move(libraries);
    _bundleProxiesByRootURLs = std::move(proxies);
    _rootURLs = std::move(roots);
  });
}

std::shared_ptr<const LocalAppLibraryManager::AppLibraries>
LocalAppLibraryManager::appLibrariesByItemIDs() const {
  return _queue.sync([this] { return _appLibrariesByItemIDs; });
}

std::shared_ptr<const LocalAppLibraryManager::BundleProxies>
LocalAppLibraryManager::bundleProxiesByRootURLs() const {
  return _queue.sync([this] { return _bundleProxiesByRootURLs; });
}

std::shared_ptr<const std::vector<FndURL>> LocalAppLibraryManager::rootURLs() const {
  return _queue.sync([this] { return _rootURLs; });
}

std::optional<std::string> LocalAppLibraryManager::bundleIdentifierOfLibraryContaining(
    const FndURL& url) const {
  const auto [roots, proxies] =
      _queue.sync([this] { return std::pair(_rootURLs, _bundleProxiesByRootURLs); });
  for (const FndURL& root : *roots) {
    if (dh_relationshipToItemAtURL(root, url) == DhURLRelationship::Contains) {
      return proxies->at(root)->bundleIdentifier();
    }
  }
  return std::nullopt;
}

}  // namespace vantrell
