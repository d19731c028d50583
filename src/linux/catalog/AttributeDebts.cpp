#include "linux/catalog/AttributeDebts.h"

#include <fcntl.h>

#include <cerrno>

#include "linux/catalog/KeptAttributes.h"
#include "linux/catalog/Paths.h"
#include "platform/foundation/PosixNames.h"

namespace vantrell::linuxos::catalog {

namespace {

/// The error is that of the first step that failed; ESTALE when another object stands there.
OsResult<void> giveAttributes(const Place& place, const Document& document,
                              const std::vector<Attribute>& attributes) {
  auto file = openWithoutLinks(place.folder.get(), place.name, O_PATH | O_NOFOLLOW);
  if (!file) return std::unexpected(file.error());
  const auto self = lookAtDescriptor(file->get(), nullptr);
  if (!self) return std::unexpected(self.error());
  if (self->fileID != document.object.fileID) return std::unexpected(ESTALE);
  return setMissingAttributes(file->get(), attributes);
}

/// Setting an attribute has changed the file's ctime, which is no news to anybody, under none of
/// its names.
Result<void> catalogueAgain(Store& store, const Place& place, const Document& document,
                            const FolderRules& rules) {
  const FolderReader reader(place.folder.get(), rules);
  const auto seen = reader.lookAt(std::string(place.name));
  if (!seen || !*seen || (*seen)->fileID != document.object.fileID) return {};
  const auto names = store.entries.placesOfFileID(document.object.fileID);
  if (!names) return std::unexpected(names.error());
  for (PlacedEntry placed : *names) {
    if (placed.entry.object() != document.object) continue;
    placed.entry.size = (*seen)->size;
    placed.entry.modifiedNanoseconds = (*seen)->modifiedNanoseconds;
    placed.entry.changedNanoseconds = (*seen)->changedNanoseconds;
    if ((*seen)->kind.isRecent()) {
      placed.entry.kind = placed.entry.kind.with(EntryKind::kRecent);
    }
    if (auto put = store.entries.put(placed.parent, placed.entry); !put) return put;
  }
  return {};
}

Result<void> pay(Store& store, const std::string& path, Document document, const FolderRules& rules,
                 const LogLine& log) {
  const auto kept = store.documents.keptAttributes(document.documentID);
  if (!kept) return std::unexpected(kept.error());
  const auto place = placeOf(path);
  const auto given = place ? giveAttributes(*place, document, *kept)
                           : OsResult<void>(std::unexpected(place.error()));
  if (!given) {
    log(LogLevel::Debug, "can't set the attributes that \"" + path + "\" takes along; " +
                             posixErrorDescription(given.error()));
    return {};
  }
  document.owesAttributes = false;
  if (auto put = store.documents.put(document); !put) return put;
  if (const auto all = readKeptAttributes(place->folder.get(), std::string(place->name))) {
    auto noted = store.documents.keepAttributes(document.documentID, *all);
    if (!noted) return noted;
  }
  return catalogueAgain(store, *place, document, rules);
}

}  // namespace

Result<void> payAttributeDebts(Store& store, const std::vector<RootRecord>& roots,
                               const FolderRules& rules, const LogLine& log) {
  const auto owing = store.documents.documentsThatOweAttributes();
  if (!owing) return std::unexpected(owing.error());
  for (const Document& document : *owing) {
    const Home& home = document.home;
    const auto path = home.isOutOfView() ? Result<std::optional<std::string>>(home.name)
                                         : pathOf(store.entries, roots, home.parent, home.name);
    if (!path) return std::unexpected(path.error());
    if (!*path) continue;
    if (auto paid = pay(store, **path, document, rules, log); !paid) return paid;
  }
  return {};
}

}  // namespace vantrell::linuxos::catalog
