// How a record is built: the reading half of `LocalItem`.

#include <array>
#include <cerrno>
#include <utility>

#include "applibraries/LocalAppLibraryManager.h"
#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "identity/ZubFileObjectIdentifier.h"
#include "items/ItemMetadata.h"
#include "items/LocalItem.h"
#include "platform/Services.h"
#include "platform/dochost/DhURLOperations.h"
#include "support/Errors.h"
#include "support/Log.h"
#include "support/ResourceAccess.h"

namespace vantrell {
namespace {

constexpr std::string_view kInboxName = "Inbox";
/// A folder has its own entry and its "." entry besides its children.
constexpr std::uint64_t kLinksThatAreNoChildren = 2;

// A URL fresh from an identifier knows nothing yet: one look for all values instead of one for
// each. A failure is no news here: the first value that is missed tells it.
void prefetch(const FndURL& url) {
  static constexpr std::array kKeys = {FndURLResourceKey::Name,
                                       FndURLResourceKey::TypeIdentifier,
                                       FndURLResourceKey::FileSize,
                                       FndURLResourceKey::CreationDate,
                                       FndURLResourceKey::IsWritable,
                                       FndURLResourceKey::ContentModificationDate,
                                       FndURLResourceKey::IsDirectory,
                                       FndURLResourceKey::IsPackage,
                                       FndURLResourceKey::ContentVersion,
                                       FndURLResourceKey::FileResourceIdentifier,
                                       FndURLResourceKey::DocumentIdentifier};
  if (url.cachedResourceValue(FndURLResourceKey::Name)) return;
  static_cast<void>(platform::services().fileSystem->readResourceValues(url, kKeys));
}

// True for what lies in the ".Trash" of a "Documents" folder, and for that ".Trash" itself.
bool isInTrash(const FndURL& url) {
  constexpr std::string_view kTrash = "/Documents/.Trash";
  const std::string& path = url.path();
  for (std::size_t at = path.find(kTrash); at != std::string::npos;
       at = path.find(kTrash, at + 1)) {
    const std::size_t end = at + kTrash.size();
    if (end == path.size() || path[end] == '/') return true;
  }
  return false;
}

bool isPackageWithSize(const std::string& type) {
  return type.starts_with("com.quillon.tessera") || type.starts_with("com.quillon.brindle");
}

}  // namespace

// Fills the fields of one record, in the order in which they depend on each other.
class LocalItem::Reader {
 public:
  Reader(const FndURL& url, const Options& options) : _url(url), _options(options), _fields(url) {}

  std::optional<Fields> read() {
    prefetch(_url);
    if (!readIdentifiers() || !readNameAndType() || isHiddenInbox()) return std::nullopt;
    readSize();
    _fields.creationDate = dateResource(FndURLResourceKey::CreationDate, _url);
    _fields.contentModificationDate =
        dateResource(FndURLResourceKey::ContentModificationDate, _url);
    _fields.versionIdentifier = dataResource(FndURLResourceKey::ContentVersion, _url);
    readCapabilities();
    _fields.lastUsedDate = readLastUsedDate(_url);
    _fields.tagData = readTagData(_url);
    _fields.favoriteRank = readFavoriteRank(_url);
    readFileInformation();
    _fields.docID = ZubFileObjectIdentifier::documentIDIn(_fields._itemIdentifier);
    readAppLibrary();
    return std::move(_fields);
  }

 private:
  bool isRoot() const { return _fields._itemIdentifier == DochostRootContainerItemIdentifier; }

  bool readIdentifiers() {
    auto identifier =
        _options.customItemID ? _options.customItemID : vantrell::itemIdentifier(_url);
    if (!identifier) {
      logDebug("can't create an item without an ID");
      return false;
    }
    _fields._itemIdentifier = std::move(*identifier);
    if (isRoot()) {
      _fields._parentItemIdentifier = DochostRootContainerItemIdentifier;
      return true;
    }
    auto parent = _options.customParentItemID
                      ? _options.customParentItemID
                      : vantrell::itemIdentifier(_url.URLByDeletingLastPathComponent());
    if (!parent) {
      logError("can't create an item without a parent ID (itemIdentifier: ",
               _fields._itemIdentifier, ")");
      return false;
    }
    _fields._parentItemIdentifier = std::move(*parent);
    _fields.isTrashed = isInTrash(_url);
    return true;
  }

  bool readNameAndType() {
    auto name = _options.customFilename ? _options.customFilename
                                        : stringResource(FndURLResourceKey::Name, _url);
    if (!name) {
      logError("can't create an item without a filename (itemIdentifier: ", _fields._itemIdentifier,
               ", parentItemIdentifier: ", _fields._parentItemIdentifier, ")");
      return false;
    }
    _fields.filename = std::move(*name);
    auto type = stringResource(FndURLResourceKey::TypeIdentifier, _url);
    if (!type) {
      logError("can't create an item without a type identifier (itemIdentifier: ",
               _fields._itemIdentifier, ", parentItemIdentifier: ", _fields._parentItemIdentifier,
               ", filename: ", _fields.filename, ")");
      return false;
    }
    _fields.typeIdentifier = std::move(*type);
    const TypeRegistry& types = *platform::services().types;
    _isPackage = types.typeConformsTo(_fields.typeIdentifier, kPackageTypeIdentifier);
    _isFolder = types.typeConformsTo(_fields.typeIdentifier, kFolderTypeIdentifier);
    return true;
  }

  // The system's own inbox folders stand at the top of the storage and of each app library.
  bool isHiddenInbox() const {
    const bool hidden = _fields.filename == kInboxName && _isFolder &&
                        (_fields._parentItemIdentifier == DochostRootContainerItemIdentifier ||
                         _fields._parentItemIdentifier.starts_with('#'));
    if (hidden) logDebug("can't create an item for the \"Inbox\" directory");
    return hidden;
  }

  void readSize() {
    if (_isPackage) {
      if (!isPackageWithSize(_fields.typeIdentifier)) return;
      const auto size = platform::services().fileSystem->recursiveSizeOfDirectory(_url);
      if (size) _fields.documentSize = *size;
    } else if (!_isFolder) {
      const auto size = numberResource(FndURLResourceKey::FileSize, _url);
      if (size) _fields.documentSize = size->exactUInt64();
    }
  }

  void readCapabilities() {
    _fields.capabilities = kDochostItemAllowsReading;
    if (isRoot()) return;
    if (boolResource(FndURLResourceKey::IsWritable, _url).value_or(false)) {
      _fields.capabilities |= kDochostItemAllowsWriting;
    }
  }

  void readFileInformation() {
    if (const auto known = knownFileID()) {
      _fields.fileID = *known;
      return;
    }
    const Result<FileStatus> status = platform::services().fileSystem->status(_url);
    if (!status) {
      const FndError error = errorWithPOSIXCode(posixCodeOfError(status.error()));
      logFailure(error.isPosix(ENOENT), "can't find fileID for item \"", _url.path(), "\"; ",
                 error);
      return;
    }
    _fields.fileID = status->fileID;
    if (_isFolder && status->linkCount >= kLinksThatAreNoChildren) {
      _fields.childItemCount = status->linkCount - kLinksThatAreNoChildren;
    }
  }

  // The look that gave the other values has told a document's number too: no need for one more.
  // A folder's children have to be counted, and a link has to be followed.
  std::optional<FileID> knownFileID() const {
    if (_isFolder || _fields.typeIdentifier == kSymbolicLinkTypeIdentifier) return std::nullopt;
    const auto known = _url.cachedResourceValue(FndURLResourceKey::FileResourceIdentifier);
    const FndNumber* number = known ? std::get_if<FndNumber>(&*known) : nullptr;
    const auto value = number == nullptr ? std::nullopt : number->exactUInt64();
    return value ? std::optional(FileID{*value}) : std::nullopt;
  }

  void readAppLibrary() {
    std::optional<std::string> bundle = _options.bundleIdentifier;
    if (!bundle && _options.hasLumenDomainIdentifier) {
      bundle = LocalAppLibraryManager::sharedManager().bundleIdentifierOfLibraryContaining(_url);
    }
    _fields.dh_lumenDomainIdentifier = bundle;
    _fields.dh_appContainerBundleIdentifier = std::move(bundle);
  }

  const FndURL& _url;
  const Options& _options;
  Fields _fields;
  bool _isPackage = false;
  bool _isFolder = false;
};

std::optional<LocalItem::Fields> LocalItem::read(const FndURL& url, const Options& options) {
  return Reader(url, options).read();
}

}  // namespace vantrell
