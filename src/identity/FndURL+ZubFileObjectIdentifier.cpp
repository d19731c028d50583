#include <cerrno>
#include <memory>
#include <string>
#include <utility>
#include <variant>

#include "applibraries/ZubAppLibraryManager.h"
#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "identity/IdentityLog.h"
#include "identity/ZubFileObjectIdentifier.h"
#include "platform/Services.h"
#include "platform/dochost/DhURLOperations.h"
#include "platform/filesystem/URLResourceValues.h"
#include "platform/foundation/Fatal.h"
#include "support/Errors.h"

namespace vantrell {
namespace {

std::string_view className(const FndURL::ResourceValue& value) {
  static constexpr std::string_view kNames[] = {"FndString",  "FndNumber", "FndDate",
                                                "FndBoolean", "FndData",   "FndURL"};
  return kNames[value.index()];
}

// A number that one of the identifying resource keys gave.
struct KnownNumber {
  enum class State { Known, Absent, Failed } state;
  std::uint64_t value = 0;
};

// The texts about one of these keys.
struct KeyTexts {
  std::string_view cannotRead;
  std::string_view unexpectedClass;
};
constexpr KeyTexts kFileIDTexts = {"can't get resource value for _kKorURLFileIDKey; ",
                                   "unexpected class for file ID (expected: FndNumber, actual: "};
constexpr KeyTexts kDocumentIDTexts = {
    "can't get resource value for FndURLDocumentIdentifierKey; ",
    "unexpected class for doc ID (expected: FndNumber, actual: "};

KnownNumber knownNumber(const FndURL& url, FndURLResourceKey key, const KeyTexts& texts) {
  const auto value = resourceValue(url, key);
  if (!value) {
    logIdentity(isNoSuchFileReadError(value.error()) ? LogLevel::Debug : LogLevel::Error,
                texts.cannotRead, value.error());
    return {KnownNumber::State::Failed};
  }
  if (!*value) return {KnownNumber::State::Absent};
  const FndNumber* number = std::get_if<FndNumber>(&**value);
  const auto exact = number == nullptr ? std::nullopt : number->exactUInt64();
  if (exact) return {KnownNumber::State::Known, *exact};
  std::string message(texts.unexpectedClass);
  developmentAssert(false, message.append(className(**value)).append(")"));
  return {KnownNumber::State::Failed};
}

// True for a URL in the storage or in an app library. Fills `libraryRoot` when the URL is the
// root folder of one.
bool isPartOfVantrell(const FndURL& url, std::optional<FndURL>& libraryRoot) {
  const auto roots = ZubAppLibraryManager::rootURLsForAppLibraries();
  for (const FndURL& root : *roots) {
    const DhURLRelationship relationship = dh_relationshipToItemAtURL(root, url);
    if (relationship == DhURLRelationship::Same) libraryRoot = root;
    if (relationship != DhURLRelationship::Other) return true;
  }
  return false;
}

// An identifier names no volume: the number of an object on another one would be misread as the
// storage's own object of that number.
bool isOnStorageVolume(const FndURL& url, OpenFile& file) {
  const DeviceID storage = deviceID(platform::services().manager->documentStorageURL());
  if (file.deviceID().value_or(DeviceID{}) == storage) return true;
  logIdentity(
      LogLevel::Debug, "can't compute file object identifier because \"",
      [&url] { return url.standardizedPath(); }, "\" is not on the volume of the storage");
  return false;
}

DochostItemIdentifier identifierOfFolderLike(const FndURL& url, FileID fileID) {
  url.setCachedResourceValue(FndURLResourceKey::FileResourceIdentifier, FndNumber(fileID.value));
  return ZubFileObjectIdentifier::fromFileID(fileID);
}

std::optional<DochostItemIdentifier> identifierOfDocument(const FndURL& url, OpenFile& file,
                                                          DocumentID documentID) {
  if (documentID.value == 0) {
    VerstowManager& verstow = *platform::services().verstow;
    verstow.prepare();
    documentID = verstow.getOrAllocateDocumentID(file).value_or(DocumentID{});
  }
  if (documentID.value == 0) {
    logIdentity(LogLevel::Error, "can't get permanent storage for \"", url.path(), "\"");
    return std::nullopt;
  }
  url.setCachedResourceValue(FndURLResourceKey::DocumentIdentifier,
                             FndNumber(std::uint64_t{documentID.value}));
  return ZubFileObjectIdentifier::fromDocumentID(documentID);
}

// Asks the object itself, for what no resource value has told.
std::optional<DochostItemIdentifier> identifierFromFileSystem(const FndURL& url) {
  const auto package = resourceValue(url, FndURLResourceKey::IsPackage);
  if (!package) {
    logIdentity(LogLevel::Error, "can't get resource FndURLIsPackageKey for \"", url.path(), "\"; ",
                package.error());
    return std::nullopt;
  }
  const bool* const packageFlag = *package ? std::get_if<bool>(&**package) : nullptr;
  const bool isPackage = packageFlag != nullptr && *packageFlag;
  const auto file = platform::services().fileSystem->open(url, OpenMode::EventOnly);
  if (!file) {
    logIdentity(LogLevel::Error, "can't open file at \"", url.path(), "\"; ",
                errnoText(file.error()));
    return std::nullopt;
  }
  const Result<FileIdentity> identity = (*file)->identity();
  if (!identity) {
    logIdentity(LogLevel::Error, "can't get attribute list for \"", url.path(), "\"; ",
                errnoText(identity.error()));
    return std::nullopt;
  }
  const bool isDocument = identity->kind == FileKind::RegularFile ||
                          (identity->kind == FileKind::Directory && isPackage);
  if (!isOnStorageVolume(url, **file)) return std::nullopt;
  if (!isDocument) return identifierOfFolderLike(url, identity->fileID);
  return identifierOfDocument(url, **file, identity->documentID);
}

std::optional<DochostItemIdentifier> identifierInsideStorage(const FndURL& url) {
  const bool isFolder = dh_isFolder(url);
  const KnownNumber known =
      isFolder ? knownNumber(url, FndURLResourceKey::FileResourceIdentifier, kFileIDTexts)
               : knownNumber(url, FndURLResourceKey::DocumentIdentifier, kDocumentIDTexts);
  if (known.state == KnownNumber::State::Failed) return std::nullopt;
  if (known.state == KnownNumber::State::Absent) return identifierFromFileSystem(url);
  if (isFolder) return ZubFileObjectIdentifier::fromFileID(FileID{known.value});
  const DocumentID documentID{static_cast<std::uint32_t>(known.value)};
  if (documentID.value != known.value) return std::nullopt;  // no document has such a number
  return ZubFileObjectIdentifier::fromDocumentID(documentID);
}

}  // namespace

Result<DeviceID> deviceIDWithError(const FndURL& url) {
  if (!url.isFileURL()) return std::unexpected(errorWithPOSIXCode(EINVAL));
  const auto file = platform::services().fileSystem->open(url, OpenMode::EventOnly);
  if (!file) return std::unexpected(errorWithPOSIXCode(posixCodeOfError(file.error())));
  const Result<DeviceID> device = (*file)->deviceID();
  if (!device) return std::unexpected(errorWithPOSIXCode(posixCodeOfError(device.error())));
  if (device->value == 0) return std::unexpected(errorWithPOSIXCode(ENODEV));
  return *device;
}

DeviceID deviceID(const FndURL& url) { return deviceIDWithError(url).value_or(DeviceID{}); }

std::optional<DochostItemIdentifier> itemIdentifier(const FndURL& url) {
  if (!url.isFileURL()) {
    logIdentity(LogLevel::Error, "can't compute file object identifier if not a file URL");
    return std::nullopt;
  }
  const FndURL& storageRoot = platform::services().manager->documentStorageURL();
  switch (dh_relationshipToItemAtURL(storageRoot, url)) {
    case DhURLRelationship::Same:
      return DochostItemIdentifier(DochostRootContainerItemIdentifier);
    case DhURLRelationship::Contains:
      return identifierInsideStorage(url);
    case DhURLRelationship::Other:
      break;
  }
  std::optional<FndURL> libraryRoot;
  if (!isPartOfVantrell(url, libraryRoot)) {
    logIdentity(
        LogLevel::Debug, "can't compute file object identifier because \"",
        [&url] { return url.standardizedPath(); }, "\" is not part of Vantrell");
    return std::nullopt;
  }
  if (libraryRoot) return ZubFileObjectIdentifier::fromAppLibraryDataContainerURL(*libraryRoot);
  return identifierInsideStorage(url);
}

}  // namespace vantrell
