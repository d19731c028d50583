#include "items/LocalItem.h"

#include <array>
#include <charconv>
#include <utility>

#include "applibraries/LocalAppLibraryManager.h"
#include "items/LocalAppLibraryItem.h"
#include "items/PutBackLocation.h"
#include "platform/Services.h"
#include "platform/dochost/DhURLOperations.h"

namespace vantrell {
namespace {

std::string addressText(const void* object) {
  std::array<char, 2 * sizeof(void*)> digits{};
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(),
                                 reinterpret_cast<std::uintptr_t>(object), 16);
  return "0x" + std::string(digits.data(), end.ptr);
}

bool typeConforms(const std::string& type, std::string_view supertype) {
  return platform::services().types->typeConformsTo(type, supertype);
}

}  // namespace

LocalItem::LocalItem(Fields fields) : _fields(std::move(fields)) {}

std::shared_ptr<const LocalItem> LocalItem::init(const FndURL& url) { return init(url, Options()); }

std::shared_ptr<const LocalItem> LocalItem::init(const FndURL& url, const Options& options) {
  std::optional<Fields> fields = read(url, options);
  return fields ? std::make_shared<LocalItem>(std::move(*fields)) : nullptr;
}

std::span<const FndURLResourceKey> LocalItem::urlKeys() {
  static constexpr std::array kKeys = {FndURLResourceKey::ParentDirectoryURL,
                                       FndURLResourceKey::Name,
                                       FndURLResourceKey::LocalizedName,
                                       FndURLResourceKey::TypeIdentifier,
                                       FndURLResourceKey::FileSize,
                                       FndURLResourceKey::CreationDate,
                                       FndURLResourceKey::ContentModificationDate,
                                       FndURLResourceKey::IsReadable,
                                       FndURLResourceKey::IsWritable};
  return kKeys;
}

const DochostItemIdentifier& LocalItem::itemIdentifier() const { return _fields._itemIdentifier; }

const DochostItemIdentifier& LocalItem::parentItemIdentifier() const {
  return _fields._parentItemIdentifier;
}

const std::string& LocalItem::filename() const { return _fields.filename; }

const std::string& LocalItem::typeIdentifier() const { return _fields.typeIdentifier; }

std::optional<std::uint64_t> LocalItem::documentSize() const { return _fields.documentSize; }

std::optional<FndDate> LocalItem::creationDate() const { return _fields.creationDate; }

std::optional<FndDate> LocalItem::contentModificationDate() const {
  return _fields.contentModificationDate;
}

std::optional<std::uint64_t> LocalItem::childItemCount() const { return _fields.childItemCount; }

std::uint64_t LocalItem::capabilities() const { return _fields.capabilities; }

const std::optional<FndData>& LocalItem::versionIdentifier() const {
  return _fields.versionIdentifier;
}

bool LocalItem::isTrashed() const { return _fields.isTrashed; }

std::optional<FndDate> LocalItem::lastUsedDate() const { return _fields.lastUsedDate; }

const std::optional<FndData>& LocalItem::tagData() const { return _fields.tagData; }

std::optional<std::uint64_t> LocalItem::favoriteRank() const { return _fields.favoriteRank; }

std::optional<FileID> LocalItem::fileID() const { return _fields.fileID; }

std::optional<DocumentID> LocalItem::docID() const { return _fields.docID; }

const FndURL& LocalItem::fileURL() const { return _fields.fileURL; }

const std::optional<std::string>& LocalItem::dh_lumenDomainIdentifier() const {
  return _fields.dh_lumenDomainIdentifier;
}

const std::optional<std::string>& LocalItem::dh_appContainerBundleIdentifier() const {
  return _fields.dh_appContainerBundleIdentifier;
}

bool LocalItem::dh_isUbiquitous() const { return false; }

std::optional<FndURL> LocalItem::putBackURL() const {
  std::call_once(_putBackOnce, [this] { _putBackURL = putBackURLOfItemAt(_fields.fileURL); });
  return _putBackURL;
}

bool LocalItem::isFolder() const {
  return typeConforms(_fields.typeIdentifier, kFolderTypeIdentifier);
}

bool LocalItem::isPackage() const {
  return typeConforms(_fields.typeIdentifier, kPackageTypeIdentifier);
}

std::string LocalItem::description() const {
  std::string text = "<";
  text.append(className()).append(":").append(addressText(this));
  text.append(" ").append(_fields._itemIdentifier);
  text.append(" name:\"").append(_fields.filename).append("\" parent:");
  const bool parentIsRoot = _fields._parentItemIdentifier == DochostRootContainerItemIdentifier;
  text.append(parentIsRoot ? std::string_view("root") : _fields._parentItemIdentifier);
  text.append(" type:").append(_fields.typeIdentifier);
  if (_fields.isTrashed) text.append(" trashed");
  if (_fields.favoriteRank) text.append(" favorite:" + std::to_string(*_fields.favoriteRank));
  return text.append(">");
}

std::shared_ptr<const LocalAppLibraryItem> LocalItem::fetchAppLibraryItem() const {
  const auto proxies = LocalAppLibraryManager::sharedManager().bundleProxiesByRootURLs();
  for (const auto& [root, proxy] : *proxies) {
    if (dh_relationshipToItemAtURL(root, _fields.fileURL) == DhURLRelationship::Contains) {
      return LocalAppLibraryItem::initWithBundleProxy(*proxy);
    }
  }
  return nullptr;
}

void LocalItem::setChildItemCount(std::optional<std::uint64_t> count) {
  _fields.childItemCount = count;
}

}  // namespace vantrell
