// Listing one folder in pages, for hosts that want its items and no changes.

#include <cerrno>
#include <memory>
#include <utility>

#include "applibraries/LocalAppLibraryManager.h"
#include "enumeration/FSDirectoryEnumerator.h"
#include "identity/ItemForIdentifierString.h"
#include "platform/dochost/DochostErrors.h"
#include "provider/LocalDochost.h"
#include "support/Errors.h"
#include "support/ResourceAccess.h"
#include "support/TracedSection.h"

namespace vantrell {
namespace {

constexpr std::size_t kPageSize = 200;

// Turns entries into pages of items.
class Pages {
 public:
  Pages(const LocalItem& folder, const DochostExtension::PageHandler& handler) : _handler(handler) {
    // What all entries of a folder have in common is looked up once, not for each of them.
    _options.customParentItemID = folder.itemIdentifier();
    _options.hasLumenDomainIdentifier = false;
    _options.bundleIdentifier =
        LocalAppLibraryManager::sharedManager().bundleIdentifierOfLibraryContaining(
            folder.fileURL().URLByAppendingPathComponent("entry"));
    _items.reserve(kPageSize);
  }

  /// False once the handler wants no more.
  bool add(const FndURL& url) {
    if (DochostItemRef item = LocalItem::init(url, _options)) _items.push_back(std::move(item));
    return _items.size() < kPageSize || deliver();
  }

  bool deliver() {
    if (_items.empty()) return true;
    std::vector<DochostItemRef> page;
    page.reserve(kPageSize);
    page.swap(_items);
    return _handler(std::move(page));
  }

 private:
  const DochostExtension::PageHandler& _handler;
  LocalItem::Options _options;
  std::vector<DochostItemRef> _items;
};

Result<std::shared_ptr<const LocalItem>> readableFolder(std::string_view identifier) {
  auto container = itemForIdentifierString(identifier);
  if (container == nullptr) return std::unexpected(dochostErrorForNonExistentItem(identifier));
  if (!container->isFolder()) return std::unexpected(errorWithPOSIXCode(ENOTDIR));
  // The scanner passes over what it cannot open; whoever asks for one folder wants to know.
  if (!boolResource(FndURLResourceKey::IsReadable, container->fileURL()).value_or(false)) {
    return std::unexpected(errorWithPOSIXCode(EACCES));
  }
  return container;
}

}  // namespace

Result<void> LocalDochost::_listItemsInContainer_pageHandler(std::string_view identifier,
                                                             const PageHandler& handler) {
  const TracedSection section("list items of ", identifier);
  if (identifier == DochostWorkingSetContainerItemIdentifier ||
      identifier == DochostAllDirectoriesContainerItemIdentifier) {
    return std::unexpected(FndError::vantrell(VantrellErrorCode::NotHereYet,
                                              "Containers that span folders are not here yet."));
  }
  const auto container = readableFolder(identifier);
  if (!container) return std::unexpected(container.error());
  const FSDirectoryEnumerator scanner{.urls = {(*container)->fileURL()},
                                      .recursively = false,
                                      .offset = 0,
                                      .limit = UINT64_MAX,
                                      .errorHandler = standardDirectoryErrorHandler,
                                      .directoryEnumerationOptionsFor = {}};
  Pages pages(**container, handler);
  // The scanner finishes a root whatever its handler answers; only an error ends the call.
  const FndError enough = errorWithPOSIXCode(ECANCELED);
  const auto counted = scanner.enumerate([&](const FndURL& url) -> Result<bool> {
    if (pages.add(url)) return true;
    return std::unexpected(enough);
  });
  if (counted) pages.deliver();
  return {};
}

}  // namespace vantrell
