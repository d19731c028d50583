#include "items/LocalAppLibraryItem.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "identity/ZubFileObjectIdentifier.h"
#include "platform/Services.h"
#include "support/Log.h"

namespace vantrell {
namespace {

// How many of the folders that a library does not show are there.
std::uint64_t countOfUnshownFolders(const FndURL& libraryRoot) {
  std::uint64_t count = 0;
  for (const std::string_view name : {"Inbox", ".Trash"}) {
    const FndURL url = libraryRoot.URLByAppendingPathComponent(name);
    if (platform::services().fileSystem->status(url)) ++count;
  }
  return count;
}

}  // namespace

std::shared_ptr<const LocalAppLibraryItem> LocalAppLibraryItem::initWithBundleProxy(
    const AppregBundleProxy& bundleProxy) {
  const std::optional<FndURL> container = bundleProxy.dataContainerURL();
  if (!container) {
    logError("can't create an app library item without a data container URL");
    return nullptr;
  }
  const FndURL url = container->URLByAppendingPathComponent("Documents");
  auto fields =
      read(url, {.customItemID = appLibraryIdentifier(bundleProxy),
                 .customParentItemID = DochostItemIdentifier(DochostRootContainerItemIdentifier),
                 .customFilename = bundleProxy.localizedName(),
                 .hasLumenDomainIdentifier = false,
                 .bundleIdentifier = bundleProxy.bundleIdentifier()});
  if (!fields) return nullptr;
  auto item = std::make_shared<LocalAppLibraryItem>(std::move(*fields));
  if (const std::uint64_t count = item->childItemCount().value_or(0); count != 0) {
    item->setChildItemCount(count - std::min(count, countOfUnshownFolders(url)));
  }
  return item;
}

std::shared_ptr<const LocalAppLibraryItem> LocalAppLibraryItem::init(const FndURL& url,
                                                                     const Options& options) {
  std::optional<Fields> fields = read(url, options);
  return fields ? std::make_shared<LocalAppLibraryItem>(std::move(*fields)) : nullptr;
}

std::shared_ptr<const LocalAppLibraryItem> LocalAppLibraryItem::fetchAppLibraryItem() const {
  return std::static_pointer_cast<const LocalAppLibraryItem>(shared_from_this());
}

}  // namespace vantrell
