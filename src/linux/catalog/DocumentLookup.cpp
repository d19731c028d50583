#include "linux/catalog/DocumentLookup.h"

#include <algorithm>

#include "linux/catalog/KeptAttributes.h"
#include "linux/catalog/Paths.h"

namespace vantrell::linuxos::catalog {

namespace {

std::string_view lastComponent(std::string_view path) { return path.substr(path.rfind('/') + 1); }

}  // namespace

Result<std::vector<DocumentID>> DocumentLookup::idsOf(FileID folder,
                                                      std::span<const SeenObject> objects) {
  std::vector<DocumentID> ids(objects.size());
  const auto answered = answerFromMemory(folder, objects, ids);
  if (!answered) return std::unexpected(answered.error());
  if (*answered) return ids;
  auto found = lookUp(folder, objects);
  forget();
  return found;
}

Result<void> DocumentLookup::load(FileID folder) {
  const auto version = _store.dataVersion();
  if (!version) return std::unexpected(version.error());
  if (_known && _known->fileID() == folder && *version == _dataVersion) return {};
  auto known = _reader.read(folder);
  if (!known) return std::unexpected(known.error());
  _known = std::move(*known);
  _dataVersion = *version;
  return {};
}

Result<bool> DocumentLookup::answerFromMemory(FileID folder, std::span<const SeenObject> objects,
                                              std::vector<DocumentID>& ids) {
  if (auto loaded = load(folder); !loaded) return std::unexpected(loaded.error());
  if (!_known) return false;
  for (std::size_t i = 0; i < objects.size(); ++i) {
    const SeenObject& object = objects[i];
    const KnownEntry* known =
        _known->find(lastComponent(object.path), object.fileID, object.changedNanoseconds);
    if (known == nullptr || known->documentID == DocumentID{}) return false;
    ids[i] = known->documentID;
  }
  return true;
}

// At most one look: what has changed again by then is changing all the time, and gets an ID for
// what it is at this moment.
Result<std::vector<DocumentID>> DocumentLookup::lookUp(FileID folder,
                                                       std::span<const SeenObject> objects) {
  for (bool mayLook = true;; mayLook = false) {
    auto transaction = Transaction::begin(*_store.database);
    if (!transaction) return std::unexpected(transaction.error());
    std::vector<Asked> asked;
    bool isCurrent = true;
    for (const SeenObject& object : objects) {
      asked.push_back({object, {}, {}, {}, {}});
      const auto identified = identify(folder, asked.back());
      if (!identified) return std::unexpected(identified.error());
      isCurrent = isCurrent && *identified;
    }
    if (!isCurrent && mayLook) {
      // The look has a transaction of its own.
      { const Transaction ended = std::move(*transaction); }
      if (auto looked = _view.lookAgain(); !looked) return std::unexpected(looked.error());
      continue;
    }
    if (auto settled = settle(folder, asked); !settled) return std::unexpected(settled.error());
    if (auto committed = transaction->commit(); !committed) {
      return std::unexpected(committed.error());
    }
    std::vector<DocumentID> ids;
    std::ranges::transform(asked, std::back_inserter(ids), &Asked::documentID);
    return ids;
  }
}

Result<bool> DocumentLookup::identify(FileID folder, Asked& asked) {
  if (asked.seen.device != _view.device) return true;
  const auto catalogued = identifyCatalogued(folder, asked);
  if (!catalogued || *catalogued) return catalogued;
  identifyOutOfView(asked);
  return _view.isOutOfView(asked.seen.path) || !asked.object;
}

Result<bool> DocumentLookup::identifyCatalogued(FileID folder, Asked& asked) {
  const std::string name(lastComponent(asked.seen.path));
  const auto row = _store.entries.entry(folder, name);
  if (!row) return std::unexpected(row.error());
  if (!*row || (*row)->fileID != asked.seen.fileID) return false;
  const Entry& entry = **row;
  if (entry.kind.isRecent() || entry.changedNanoseconds != asked.seen.changedNanoseconds) {
    const auto found = objectStandingAt(asked.seen.path);
    if (!found || found->entry.object() != entry.object()) return false;
    asked.refreshed = found->entry;
    asked.refreshed->name = name;
    asked.refreshed->kind.bits |= entry.kind.without(EntryKind::kRecent).bits;
  }
  asked.object = entry.object();
  asked.home = entry.kind.isDocument() ? Home{folder, name} : Home::outOfView(asked.seen.path);
  return true;
}

void DocumentLookup::identifyOutOfView(Asked& asked) {
  const auto found = objectStandingAt(asked.seen.path);
  if (!found || found->entry.fileID != asked.seen.fileID) return;
  asked.object = found->entry.object();
  asked.home = Home::outOfView(asked.seen.path);
}

Result<void> DocumentLookup::settle(FileID folder, std::span<Asked> asked) {
  for (Asked& one : asked) {
    if (!one.object) continue;
    if (auto settled = settleOne(folder, one); !settled) return settled;
  }
  return {};
}

Result<void> DocumentLookup::settleOne(FileID folder, Asked& asked) {
  auto document = _store.documents.documentOfObject(*asked.object);
  if (!document) return std::unexpected(document.error());
  if (!*document) {
    const auto allocated = allocate(asked);
    if (!allocated) return std::unexpected(allocated.error());
    asked.documentID = *allocated;
  } else {
    asked.documentID = (*document)->documentID;
    if (!(*document)->isAlive) {
      (*document)->isAlive = true;
      (*document)->home = asked.home;
      if (auto put = _store.documents.put(**document); !put) return put;
    }
  }
  return asked.refreshed ? refresh(folder, asked) : Result<void>();
}

Result<void> DocumentLookup::refresh(FileID folder, const Asked& asked) {
  if (auto put = _store.entries.put(folder, *asked.refreshed); !put) return put;
  const auto document = _store.documents.document(asked.documentID);
  if (!document) return std::unexpected(document.error());
  if (!*document || (*document)->owesAttributes) return {};
  const auto place = placeOf(asked.seen.path);
  if (!place) return {};
  const auto attributes = readKeptAttributes(place->folder.get(), asked.refreshed->name);
  if (!attributes) return {};
  return _store.documents.keepAttributes(asked.documentID, *attributes);
}

Result<DocumentID> DocumentLookup::allocate(const Asked& asked) {
  const auto documentID = _store.numbers.next();
  if (!documentID) return std::unexpected(documentID.error());
  const Document document{*documentID, *asked.object, asked.home, true, false};
  if (auto put = _store.documents.put(document); !put) return std::unexpected(put.error());
  const auto place = placeOf(asked.seen.path);
  const auto attributes =
      place ? readKeptAttributes(place->folder.get(), std::string(place->name)) : std::nullopt;
  if (attributes && !attributes->empty()) {
    auto kept = _store.documents.keepAttributes(*documentID, *attributes);
    if (!kept) return std::unexpected(kept.error());
  }
  return documentID;
}

Result<DocumentID> DocumentLookup::existingIDOf(const SeenObject& object) {
  Asked asked{object, {}, {}, {}, {}};
  for (bool mayLook = true;; mayLook = false) {
    FileID folder;
    const auto places = _store.entries.placesOfFileID(object.fileID);
    if (!places) return std::unexpected(places.error());
    const auto place = std::ranges::find(
        *places, lastComponent(object.path),
        [](const PlacedEntry& each) { return std::string_view(each.entry.name); });
    if (place != places->end()) folder = place->parent;
    const auto identified = identify(folder, asked);
    if (!identified) return std::unexpected(identified.error());
    if (*identified || !mayLook) break;
    if (auto looked = _view.lookAgain(); !looked) return std::unexpected(looked.error());
  }
  if (!asked.object) return DocumentID{};
  const auto document = _store.documents.documentOfObject(*asked.object);
  if (!document) return std::unexpected(document.error());
  return *document && (*document)->isAlive ? (*document)->documentID : DocumentID{};
}

}  // namespace vantrell::linuxos::catalog
