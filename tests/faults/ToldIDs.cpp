#include "ToldIDs.h"

#include <unistd.h>

#include <cerrno>
#include <charconv>

#include "ObservedTree.h"

namespace vantrell::faults {
namespace {

std::string describe(DocumentID documentID) {
  return "document " + std::to_string(documentID.value);
}

bool exists(const std::string& path) { return ::access(path.c_str(), F_OK) == 0; }

}  // namespace

void ToldIDs::read(std::string_view reports) {
  while (!reports.empty()) {
    const std::size_t end = reports.find('\n');
    // A line without its end was cut off with its writer, who had told nobody yet.
    if (end == std::string_view::npos) return;
    readLine(reports.substr(0, end));
    reports.remove_prefix(end + 1);
  }
}

void ToldIDs::readLine(std::string_view line) {
  const std::string_view rest = line.substr(2);
  const std::size_t space = rest.find(' ');
  if (line.starts_with("E ")) {
    _errors.emplace_back(rest);
  } else if (line.starts_with("R ")) {
    renamed(std::string(rest.substr(0, space)), std::string(rest.substr(space + 1)));
  } else {
    DocumentID documentID;
    std::from_chars(rest.data(), rest.data() + space, documentID.value);
    told(documentID, std::string(rest.substr(space + 1)));
  }
}

void ToldIDs::told(DocumentID documentID, const std::string& path) {
  const auto [ofPath, isNewPath] = _documents.emplace(path, documentID);
  if (!isNewPath && ofPath->second != documentID) {
    complain(path + " was told " + describe(ofPath->second) + " and then " + describe(documentID));
  }
  const auto [ofDocument, isNewDocument] = _promises.emplace(documentID, Promise{path});
  Promise& promise = ofDocument->second;
  if (!isNewDocument && promise.path != path) {
    complain(describe(documentID) + " was told for " + promise.path + " and for " + path);
  }
  promise.wasRefused = false;
}

void ToldIDs::renamed(const std::string& from, const std::string& to) {
  // The writer may have died before it did what it had announced; the new name is used once.
  if (!exists(to) && exists(from)) return;
  const auto known = _documents.extract(from);
  for (auto& [documentID, promise] : _promises) {
    if (promise.path == from) promise.path = to;
  }
  if (!known.empty()) _documents.emplace(to, known.mapped());
}

void ToldIDs::expectAllKept(linuxos::FileIndex& index) { expect(index, false); }

void ToldIDs::expectKeptOrRefused(linuxos::FileIndex& index) { expect(index, true); }

void ToldIDs::expect(linuxos::FileIndex& index, bool mayRefuse) {
  for (auto& [documentID, promise] : _promises) {
    const std::string& path = promise.path;
    const auto fileID = index.fileIDOfDocument(documentID);
    const bool isRefused = !fileID && fileID.error().isPosix(ENOENT);
    if (isRefused && (mayRefuse || promise.wasRefused)) {
      ++_refused;
      promise.wasRefused = true;
      continue;
    }
    if (!fileID) {
      complain(describe(documentID) + ", told for " + path + ": " + fileID.error().description());
      continue;
    }
    const auto found = index.pathForFileID(*fileID);
    if (*fileID != properties::seeObject(path).fileID) {
      complain(describe(documentID) + ", told for " + path + ", is " +
               (found ? *found : found.error().description()));
    } else if (!found || *found != path) {
      complain(describe(documentID) + " at " + path + " is said to be at " +
               (found ? *found : found.error().description()));
    } else {
      ++_kept;
    }
  }
}

void ToldIDs::databaseWasLost() { _documents.clear(); }

std::string ToldIDs::complaints() const {
  std::string text;
  for (const std::string& complaint : _complaints) text += complaint + "\n";
  return text;
}

}  // namespace vantrell::faults
