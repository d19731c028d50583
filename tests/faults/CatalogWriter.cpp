#include "CatalogWriter.h"

#include <fcntl.h>
#include <linux/fs.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "ObservedTree.h"
#include "linux/FileDescriptor.h"

namespace vantrell::faults {
namespace {

namespace fs = std::filesystem;

void writeFile(const std::string& path) {
  const linuxos::FileDescriptor file(
      ::open(path.c_str(), O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC, 0600));
  if (!file || ::write(file.get(), "content", 7) != 7) std::abort();
}

}  // namespace

bool CatalogWriter::work(int rounds) {
  auto opened = linuxos::Catalog::open({_state, {_root}, _types, {}});
  if (!opened) {
    report("E open: " + opened.error().description());
    return false;
  }
  if (!lookAndAsk(**opened)) return false;
  for (int round = 0; round < rounds; ++round) {
    for (auto changes = 1 + _random() % 3; changes > 0; --changes) changeSomething();
    if (!lookAndAsk(**opened)) return false;
  }
  return true;
}

bool CatalogWriter::lookAndAsk(linuxos::Catalog& catalog) {
  if (const auto looked = catalog.look(); !looked) {
    report("E look: " + looked.error().description());
    return false;
  }
  _changed.clear();
  return std::ranges::all_of(
      folders(), [&](const std::string& folder) { return askForFolder(catalog, folder); });
}

bool CatalogWriter::askForFolder(linuxos::Catalog& catalog, const std::string& folder) {
  std::vector<linuxos::SeenObject> objects;
  for (const std::string& path : documentsIn(folder)) {
    objects.push_back(properties::seeObject(path));
  }
  const FileID folderID = properties::seeObject(folder).fileID;
  const auto documentIDs = catalog.documentIDsOfObjects(folderID, objects);
  if (!documentIDs) {
    report("E ask: " + documentIDs.error().description());
    return false;
  }
  for (std::size_t at = 0; at < objects.size(); ++at) {
    report("T " + std::to_string((*documentIDs)[at].value) + " " + objects[at].path);
  }
  return true;
}

void CatalogWriter::changeSomething() {
  const std::vector<std::string> all = folders();
  const std::string& folder = all[_random() % all.size()];
  const std::vector<std::string> documents = documentsIn(folder);
  const auto choice = _random() % 4;
  if (documents.empty() || choice == 0) return createFile(folder);
  const std::string& path = documents[_random() % documents.size()];
  // Saved and renamed between two looks, a file is a new one: nobody saw it at its old place.
  if (!_changed.insert(path).second) return;
  if (choice == 1) return saveThroughTemporary(path);
  if (choice == 2) return saveByExchange(path);
  rename(path);
}

void CatalogWriter::createFile(const std::string& folder) { writeFile(folder + "/" + freshName()); }

void CatalogWriter::saveThroughTemporary(const std::string& path) {
  const std::string temporary = path + freshName() + ".tmp";
  writeFile(temporary);
  if (::rename(temporary.c_str(), path.c_str()) != 0) std::abort();
}

void CatalogWriter::saveByExchange(const std::string& path) {
  const std::string temporary = path + freshName() + ".tmp";
  writeFile(temporary);
  if (::renameat2(AT_FDCWD, temporary.c_str(), AT_FDCWD, path.c_str(), RENAME_EXCHANGE) != 0) {
    std::abort();
  }
  ::unlink(temporary.c_str());
}

void CatalogWriter::rename(const std::string& path) {
  // No name is used twice, so that what a killed writer did can be told from the disk.
  const std::string to = path.substr(0, path.rfind('/') + 1) + freshName();
  _changed.insert(to);
  report("R " + path + " " + to);
  if (::rename(path.c_str(), to.c_str()) != 0) std::abort();
}

std::vector<std::string> CatalogWriter::folders() const {
  std::vector<std::string> found = {_root};
  for (const auto& entry : fs::directory_iterator(_root)) {
    if (entry.is_directory()) found.push_back(entry.path());
  }
  std::ranges::sort(found);
  return found;
}

std::vector<std::string> CatalogWriter::documentsIn(const std::string& folder) const {
  std::vector<std::string> found;
  for (const auto& entry : fs::directory_iterator(folder)) {
    const bool isHalfSaved = entry.path().extension() == ".tmp";
    if (entry.is_regular_file() && !isHalfSaved) found.push_back(entry.path());
  }
  std::ranges::sort(found);
  return found;
}

std::string CatalogWriter::freshName() { return "n" + std::to_string(_random()); }

void CatalogWriter::report(const std::string& line) const {
  const std::string whole = line + "\n";
  const ssize_t written = ::write(_reports, whole.data(), whole.size());
  if (written != static_cast<ssize_t>(whole.size())) std::abort();
}

}  // namespace vantrell::faults
