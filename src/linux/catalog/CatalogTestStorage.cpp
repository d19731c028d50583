#include "linux/catalog/CatalogTestStorage.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <ctime>
#include <filesystem>
#include <fstream>

#include "linux/filesystem/ObjectStatus.h"

namespace vantrell::linuxos {

namespace fs = std::filesystem;

std::string TesseraTypes::typeIdentifierForName(std::string_view name, FileKind kind) const {
  if (kind != FileKind::Directory) return std::string(kDataTypeIdentifier);
  return name.ends_with(".tessera") ? "com.quillon.tessera.document"
                                    : std::string(kFolderTypeIdentifier);
}

bool TesseraTypes::typeConformsTo(std::string_view type, std::string_view supertype) const {
  if (type == supertype) return true;
  return type == "com.quillon.tessera.document" && supertype == kPackageTypeIdentifier;
}

std::string TesseraTypes::descriptionOfType(std::string_view type) const {
  return std::string(type);
}

CatalogTest::CatalogTest() {
  std::string pattern = fs::canonical(fs::temp_directory_path()).string() + "/catalog-XXXXXX";
  _folder = ::mkdtemp(pattern.data());
  for (const char* name : {"/storage", "/state", "/outside"}) fs::create_directory(_folder + name);
  roots = {_folder + "/storage"};
}

CatalogTest::~CatalogTest() {
  _catalog.reset();
  if (_wasRoot) {
    EXPECT_EQ(::seteuid(0), 0);
  }
  std::error_code ignored;
  fs::remove_all(_folder, ignored);
}

std::string CatalogTest::path(std::string_view name) const {
  return name.empty() ? _folder + "/storage" : _folder + "/storage/" + std::string(name);
}

std::string CatalogTest::outside(std::string_view name) const {
  return _folder + "/outside/" + std::string(name);
}

void CatalogTest::write(std::string_view name, std::string_view text) {
  std::ofstream file(path(name), std::ios::binary | std::ios::trunc);
  file << text;
  file.close();
  ASSERT_TRUE(file.good()) << path(name);
}

void CatalogTest::makeFolder(std::string_view name) { fs::create_directories(path(name)); }

void CatalogTest::rename(std::string_view from, std::string_view to) {
  ASSERT_EQ(::rename(path(from).c_str(), path(to).c_str()), 0) << from << " to " << to;
}

void CatalogTest::moveOut(std::string_view name, std::string_view to) {
  ASSERT_EQ(::rename(path(name).c_str(), outside(to).c_str()), 0) << name;
}

void CatalogTest::moveIn(std::string_view from, std::string_view name) {
  ASSERT_EQ(::rename(outside(from).c_str(), path(name).c_str()), 0) << name;
}

void CatalogTest::exchange(std::string_view one, std::string_view other) {
  ASSERT_EQ(
      ::renameat2(AT_FDCWD, path(one).c_str(), AT_FDCWD, path(other).c_str(), RENAME_EXCHANGE), 0);
}

void CatalogTest::link(std::string_view existing, std::string_view added) {
  ASSERT_EQ(::link(path(existing).c_str(), path(added).c_str()), 0);
}

void CatalogTest::remove(std::string_view name) { ASSERT_GT(fs::remove_all(path(name)), 0U); }

void CatalogTest::setAttribute(std::string_view name, const char* attribute,
                               std::string_view value) {
  ASSERT_EQ(::lsetxattr(path(name).c_str(), attribute, value.data(), value.size(), 0), 0)
      << name << ": errno " << errno;
}

std::string CatalogTest::attribute(std::string_view name, const char* attribute) const {
  std::array<char, 256> value{};
  const ssize_t size = ::lgetxattr(path(name).c_str(), attribute, value.data(), value.size());
  return size < 0 ? std::string("none") : std::string(value.data(), static_cast<size_t>(size));
}

void CatalogTest::becomeOrdinaryUser() {
  if (::geteuid() != 0) return;
  constexpr uid_t kNobody = 65534;
  ASSERT_EQ(::chown(_folder.c_str(), kNobody, kNobody), 0);
  for (const auto& entry : fs::recursive_directory_iterator(_folder)) {
    ASSERT_EQ(::lchown(entry.path().c_str(), kNobody, kNobody), 0);
  }
  ASSERT_EQ(::seteuid(kNobody), 0);
  _wasRoot = true;
}

void CatalogTest::letTimePass() const {
  const std::string probe = _folder + "/probe";
  const auto stamp = [&] {
    std::ofstream(probe) << "x";
    struct stat status {};
    ::stat(probe.c_str(), &status);
    return status.st_ctim.tv_sec * 1'000'000'000 + status.st_ctim.tv_nsec;
  };
  // The file system's own clock has to pass the time in which two changes may look alike.
  const auto start = stamp();
  while (stamp() - start < 60'000'000) {
  }
}

CatalogOptions CatalogTest::options() {
  return {_folder + "/state", roots, _types,
          [this](LogLevel level, const std::string& line) { _lines.emplace_back(level, line); }};
}

Catalog& CatalogTest::catalog() {
  if (!_catalog) {
    auto opened = Catalog::open(options());
    if (!opened) throw std::runtime_error(opened.error().description());
    _catalog = std::move(*opened);
  }
  return *_catalog;
}

LookReport CatalogTest::look() {
  const auto report = catalog().look();
  if (!report) throw std::runtime_error(report.error().description());
  return *report;
}

LookReport CatalogTest::lookAfterRestart() {
  close();
  return look();
}

FileID CatalogTest::fileID(std::string_view name) const {
  struct stat status {};
  if (::lstat(path(name).c_str(), &status) != 0) return FileID{};
  return FileID{status.st_ino};
}

SeenObject CatalogTest::seen(std::string_view name) const {
  const auto status = linuxos::lookAt(AT_FDCWD, path(name).c_str());
  if (!status) throw std::runtime_error("nothing at " + path(name));
  return seenObject(path(name), *status, name.ends_with(".tessera"));
}

DocumentID CatalogTest::idOf(std::string_view name) {
  const std::vector<SeenObject> objects{seen(name)};
  const std::size_t slash = name.rfind('/');
  const FileID parent = fileID(slash == std::string_view::npos ? "" : name.substr(0, slash));
  const auto ids = catalog().documentIDsOfObjects(parent, objects);
  if (!ids) throw std::runtime_error(ids.error().description());
  return ids->front();
}

DocumentID CatalogTest::knownIDOf(std::string_view name) {
  return catalog().documentIDOfObject(seen(name));
}

std::string CatalogTest::placeOf(DocumentID documentID) {
  const auto file = catalog().fileIDOfDocument(documentID);
  if (!file) return file.error().isPosix(ENOENT) ? "" : file.error().description();
  const auto place = catalog().pathForFileID(*file);
  if (!place) return place.error().description();
  return place->starts_with(path("")) ? place->substr(path("").size() + 1) : *place;
}

std::vector<std::string> CatalogTest::errorLines() const {
  std::vector<std::string> errors;
  for (const auto& [level, line] : _lines) {
    if (level == LogLevel::Error) errors.push_back(line);
  }
  return errors;
}

}  // namespace vantrell::linuxos
