#include "identity/ItemForIdentifierString.h"

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "identity/ZubFileObjectIdentifier.h"
#include "items/LocalAppLibraryItem.h"
#include "platform/Services.h"
#include "support/Log.h"

namespace vantrell {
namespace {

constexpr std::string_view kTemporaryLocalFolderName = ".TemporaryLocalFolder";

std::shared_ptr<const LocalItem> appLibraryItem(std::string_view bundleIdentifier) {
  Appreg* const appreg = platform::services().appreg;
  const Appreg::BundleProxy proxy =
      appreg == nullptr ? nullptr : appreg->bundleProxyForIdentifier(bundleIdentifier);
  if (proxy == nullptr) return nullptr;
  return LocalAppLibraryItem::initWithBundleProxy(*proxy);
}

std::shared_ptr<const LocalItem> temporaryLocalFolderItem() {
  const FndURL url = platform::services().manager->documentStorageURL().URLByAppendingPathComponent(
      kTemporaryLocalFolderName);
  if (const auto made = platform::services().fileSystem->createDirectory(url); !made) {
    logError("can't create temporary directory; ", made.error());
    return nullptr;
  }
  return LocalItem::init(url);
}

}  // namespace

std::shared_ptr<const LocalItem> itemForIdentifierString(std::string_view identifier) {
  if (const auto bundle = ZubFileObjectIdentifier::bundleIdentifierIn(identifier)) {
    return appLibraryItem(*bundle);
  }
  if (identifier == DochostTemporaryLocalFolderItemIdentifier) return temporaryLocalFolderItem();
  const std::optional<FndURL> url = fileURLWithItemIdentifier(identifier);
  return url ? LocalItem::init(*url) : nullptr;
}

}  // namespace vantrell
