#include "JudgedStorage.h"

#include "CatalogRows.h"

namespace vantrell::properties {

void JudgedStorage::reopen() {
  if (!_judge) _judge = std::make_unique<IdentityJudge>(storage.observe());
  _catalog.reset();  // one at a time
  storage.note("-- open");
  auto opened = linuxos::Catalog::open(
      {storage.state(), {storage.root()}, _types, [this](LogLevel level, const std::string& text) {
         if (level == LogLevel::Error) _judge->complain("the catalog says: " + shown(text));
       }});
  if (!opened) return _judge->complain("open: " + opened.error().description());
  _catalog = std::move(*opened);
}

void JudgedStorage::look(linuxos::FileIndex* index) {
  if (!_catalog) reopen();
  if (!_catalog) return;
  storage.note("-- look");
  const ObservedTree looked = storage.observe();
  const auto report = _catalog->look();
  if (!report) return _judge->complain("look: " + report.error().description());
  ObservedTree settled = storage.observe();
  for (std::string& difference : differencesFromRows(storage.state(), settled)) {
    _judge->complain(std::move(difference));
  }
  _judge->lookDone(index == nullptr ? *_catalog : *index, looked, std::move(settled));
}

DocumentID JudgedStorage::ask(const std::string& name) {
  const ObservedTree tree = storage.observe();
  const std::string full = path(name);
  for (const Place& place : tree.places()) {
    if (place.path() != full) continue;
    const FileID folder = seeObject(full.substr(0, full.rfind('/'))).fileID;
    const auto answer = _catalog->documentIDsOfObjects(folder, std::span(&place.seen, 1));
    if (!answer) break;
    _judge->told({place}, *answer);
    return answer->front();
  }
  _judge->complain("cannot ask for " + shown(name));
  return {};
}

std::string JudgedStorage::whereIs(DocumentID documentID) {
  const auto fileID = _catalog->fileIDOfDocument(documentID);
  if (!fileID) return "";
  const auto found = _catalog->pathForFileID(*fileID);
  return found ? found->substr(storage.root().size() + 1) : found.error().description();
}

std::string JudgedStorage::complaints() const {
  std::string text;
  for (const std::string& complaint : _judge->complaints()) text += complaint + "\n";
  return text;
}

}  // namespace vantrell::properties
