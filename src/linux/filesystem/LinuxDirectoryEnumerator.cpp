#include "linux/filesystem/LinuxDirectoryEnumerator.h"

#include <unistd.h>

#include <array>
#include <utility>
#include <vector>

#include "linux/PosixError.h"
#include "linux/filesystem/ResourceValues.h"

namespace vantrell::linuxos {
namespace {

using Key = FndURLResourceKey;
constexpr std::array kValuesOfOneLook = {
    Key::ParentDirectoryURL, Key::Name,          Key::LocalizedName,           Key::TypeIdentifier,
    Key::FileSize,           Key::CreationDate,  Key::ContentModificationDate, Key::IsDirectory,
    Key::IsPackage,          Key::ContentVersion};
constexpr std::array kAccessValues = {Key::IsReadable, Key::IsWritable};
constexpr std::array kIdentities = {Key::FileResourceIdentifier, Key::DocumentIdentifier};

WalkOptions walkOptions(std::uint8_t options) {
  return {.skipsHidden = (options & kSkipsHiddenFiles) != 0,
          .entersFolders = (options & kSkipsSubdirectoryDescendants) == 0,
          .entersPackages = (options & kSkipsPackageDescendants) == 0};
}

std::string pathBelow(std::string_view folder, std::string_view name) {
  std::string path;
  path.reserve(folder.size() + 1 + name.size());
  path += folder;
  path += '/';
  path += name;
  return path;
}

}  // namespace

LinuxDirectoryEnumerator::LinuxDirectoryEnumerator(FileDescriptor folder, Request request,
                                                   FileIndex& index, const TypeRegistry& types)
    : _request(std::move(request)),
      _index(index),
      _types(types),
      _parent(_request.folder),
      _mount(mountAccessOf(folder.get())),
      _user(::geteuid()),
      _walk(
          std::move(folder), _request.folder.path(), walkOptions(_request.options),
          [this](const WalkFolder& in, std::span<WalkEntry> entries) { prepare(in, entries); },
          [this](const std::string& path, int osError) { return handleError(path, osError); }) {}

std::optional<FndURL> LinuxDirectoryEnumerator::next() {
  const WalkEntry* entry = _walk.next();
  if (entry == nullptr) {
    _inHand.reset();
    return std::nullopt;
  }
  const WalkFolder folder = _walk.folder();
  FndURL url = FndURL::fileURLWithPath(pathBelow(folder.path, entry->name));
  rememberValues(url, *entry, folder);
  _inHand = std::make_shared<const EntryInHand>(url, folder.descriptor);
  EntryInHand::take(_inHand);
  return url;
}

bool LinuxDirectoryEnumerator::handleError(const std::string& path, int osError) {
  return _request.errorHandler != nullptr &&
         _request.errorHandler(FndURL::fileURLWithPath(path), readError(osError));
}

void LinuxDirectoryEnumerator::prepare(const WalkFolder& folder, std::span<WalkEntry> entries) {
  for (WalkEntry& entry : entries) {
    if (entry.osError != 0 || entry.status.kind != FileKind::Directory) continue;
    entry.isPackage = _types.typeConformsTo(
        _types.typeIdentifierForName(entry.name, FileKind::Directory), kPackageTypeIdentifier);
  }
  askForDocumentIDs(folder, entries);
  noteUncatalogued(folder, entries);
}

void LinuxDirectoryEnumerator::askForDocumentIDs(const WalkFolder& folder,
                                                 std::span<WalkEntry> entries) {
  std::vector<SeenObject> documents;
  std::vector<WalkEntry*> askedFor;
  for (WalkEntry& entry : entries) {
    // A document on another volume cannot be named: identifiers carry no device.
    if (entry.osError != 0 || entry.status.device != folder.status.device) continue;
    if (!isDocument(entry.status.kind, entry.isPackage)) continue;
    documents.push_back(
        seenObject(pathBelow(folder.path, entry.name), entry.status, entry.isPackage));
    askedFor.push_back(&entry);
  }
  if (documents.empty()) return;
  const auto known = _index.documentIDsOfObjects(folder.status.fileID, documents);
  // Without an answer the entries are given without IDs, and who needs one hears the error.
  if (!known) return;
  for (std::size_t i = 0; i < askedFor.size(); ++i) askedFor[i]->documentID = (*known)[i];
}

// File IDs are about to be handed out, and what the catalog does not hold could not be found by
// them.
void LinuxDirectoryEnumerator::noteUncatalogued(const WalkFolder& folder,
                                                std::span<const WalkEntry> entries) {
  if (_index.entryCountOfFolder(folder.status.fileID)) return;
  for (const WalkEntry& entry : entries) {
    if (entry.osError != 0 || isDocument(entry.status.kind, entry.isPackage)) continue;
    _index.noteSeen(seenObject(pathBelow(folder.path, entry.name), entry.status, entry.isPackage));
  }
}

void LinuxDirectoryEnumerator::rememberValues(const FndURL& url, const WalkEntry& entry,
                                              const WalkFolder& folder) {
  if (_parent.path() != folder.path) _parent = FndURL::fileURLWithPath(folder.path);
  ObjectView view{.status = entry.status,
                  .typeIdentifier = _types.typeIdentifierForName(entry.name, entry.status.kind),
                  .isPackage = entry.isPackage,
                  .access = {},
                  .documentID = entry.documentID};
  const auto remember = [&](std::span<const Key> keys) {
    for (const Key key : keys) {
      auto value = makeResourceValue(key, url, _parent, view);
      if (value) url.setCachedResourceValue(key, *std::move(value));
    }
  };
  remember(kValuesOfOneLook);
  if (entry.status.device == folder.status.device) remember(kIdentities);
  if (!_request.wantsAccess) return;
  view.access = accessTo(folder.descriptor->get(), entry.name.data(), entry.status, _mount, _user);
  remember(kAccessValues);
}

}  // namespace vantrell::linuxos
