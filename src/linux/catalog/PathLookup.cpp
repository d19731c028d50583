#include "linux/catalog/PathLookup.h"

#include <cerrno>

#include "linux/PosixError.h"
#include "linux/catalog/Paths.h"

namespace vantrell::linuxos::catalog {

Result<std::string> PathLookup::pathForFileID(FileID fileID) {
  if (fileID == FileID{}) return std::unexpected(posixError(ENOENT));
  auto path = cataloguedPath(fileID);
  if (path && !*path) path = seenPath(fileID);
  if (path && !*path) {
    if (auto looked = _view.lookAgain(); !looked) return std::unexpected(looked.error());
    path = cataloguedPath(fileID);
  }
  if (!path) return std::unexpected(path.error());
  if (!*path) return std::unexpected(posixError(ENOENT));
  return std::move(**path);
}

bool PathLookup::stands(const std::string& path, const ObjectID& object) const {
  const auto found = objectStandingAt(path);
  return found && found->entry.object() == object && found->device == _view.device;
}

Result<std::optional<std::string>> PathLookup::cataloguedPath(FileID fileID) {
  for (const RootRecord& root : _view.roots) {
    if (root.object.fileID == fileID && stands(root.path, root.object)) return root.path;
  }
  const auto places = _store.entries.placesOfFileID(fileID);
  if (!places) return std::unexpected(places.error());
  for (const PlacedEntry& place : *places) {
    auto path = pathOf(_store.entries, _view.roots, place.parent, place.entry.name);
    if (!path) return path;
    // With another generation the number is another object's by now, and there may be more that
    // the catalog does not know yet.
    if (*path && stands(**path, place.entry.object())) return path;
  }
  return std::nullopt;
}

Result<std::optional<std::string>> PathLookup::seenPath(FileID fileID) {
  auto seen = _store.seen.place(fileID);
  if (!seen) return std::unexpected(seen.error());
  if (!*seen || !stands((*seen)->path, {fileID, (*seen)->generation})) return std::nullopt;
  return std::move((*seen)->path);
}

Result<FileID> PathLookup::fileIDOfDocument(DocumentID documentID) {
  const auto document = _store.documents.document(documentID);
  if (!document) return std::unexpected(document.error());
  if (!*document || (*document)->object.fileID == FileID{}) {
    return std::unexpected(posixError(ENOENT));
  }
  const auto atHome = isAtHome(**document);
  if (!atHome) return std::unexpected(atHome.error());
  if (*atHome) return (*document)->object.fileID;
  // It was moved, saved or deleted since the last look, or it came back.
  if (auto looked = _view.lookAgain(); !looked) return std::unexpected(looked.error());
  const auto again = _store.documents.document(documentID);
  if (!again) return std::unexpected(again.error());
  if (!*again || !(*again)->isAlive) return std::unexpected(posixError(ENOENT));
  return (*again)->object.fileID;
}

Result<bool> PathLookup::isAtHome(const Document& document) {
  if (!document.isAlive) return false;
  const Home& home = document.home;
  if (home.isOutOfView()) return stands(home.name, document.object);
  const auto path = pathOf(_store.entries, _view.roots, home.parent, home.name);
  if (!path) return std::unexpected(path.error());
  return *path && stands(**path, document.object);
}

Result<void> PathLookup::noteSeen(const SeenObject& object) {
  const auto places = _store.entries.placesOfFileID(object.fileID);
  if (!places) return std::unexpected(places.error());
  if (!places->empty()) return {};
  const auto known = _store.seen.place(object.fileID);
  if (!known) return std::unexpected(known.error());
  const auto found = objectStandingAt(object.path);
  if (!found || found->entry.fileID != object.fileID) return {};
  const std::uint64_t generation = found->entry.generation;
  if (*known && (*known)->path == object.path && (*known)->generation == generation) return {};
  return _store.seen.put({object.fileID, generation}, object.path);
}

}  // namespace vantrell::linuxos::catalog
