#include <sys/stat.h>

#include <filesystem>
#include <functional>
#include <stdexcept>

#include "linux/catalog/Catalog.h"
#include "linux/filesystem/LinuxExtendedAttributes.h"
#include "linux/filesystem/LinuxFileSystem.h"
#include "linux/filesystem/LinuxVerstow.h"
#include "linux/filesystem/LinuxVolumes.h"
#include "linux/types/SharedMimeTypes.h"
#include "tests/contracts/Environment.h"
#include "tests/contracts/TemporaryFolder.h"
#include "tests/fakes/FakeFileIndex.h"

namespace vantrell::testing {
namespace {

namespace fs = std::filesystem;

/// The index behind the services, and how it is made to look at a folder.
struct Index {
  std::unique_ptr<linuxos::FileIndex> index;
  std::function<void(const std::string& path)> look;
};

Index makeFakeIndex(const std::string& storage) {
  auto index = std::make_unique<fakes::FakeFileIndex>(storage);
  auto* fake = index.get();
  return {std::move(index), [fake](const std::string& path) {
            struct stat status;
            if (::stat(path.c_str(), &status) != 0) throw std::runtime_error("no " + path);
            const auto entries = std::distance(fs::directory_iterator(path), {});
            fake->setEntryCount(FileID{status.st_ino}, static_cast<std::uint64_t>(entries));
          }};
}

Index makeCatalog(const std::string& storage, const std::string& state, const TypeRegistry& types) {
  auto opened = linuxos::Catalog::open(
      {.stateFolder = state, .roots = {storage}, .types = types, .log = nullptr});
  if (!opened) throw std::runtime_error(opened.error().description());
  auto* catalog = opened->get();
  const auto look = [catalog] {
    if (const auto done = catalog->look(); !done) {
      throw std::runtime_error(done.error().description());
    }
  };
  look();
  return {*std::move(opened), [look](const std::string&) { look(); }};
}

enum class IndexKind { Fake, Catalog };

class LinuxEnvironment : public Environment {
 public:
  explicit LinuxEnvironment(IndexKind kind)
      : _types(declareTypes()),
        _index(kind == IndexKind::Fake ? makeFakeIndex(_storage.path())
                                       : makeCatalog(_storage.path(), _state.path(), _types)),
        _fileSystem(*_index.index, _types),
        _volumes(*_index.index, _storage.path()),
        _verstow(*_index.index, _types, _storage.path()) {}

  FileSystem& fileSystem() override { return _fileSystem; }
  ExtendedAttributes& attributes() override { return _attributes; }
  Volumes& volumes() override { return _volumes; }
  VerstowManager& verstow() override { return _verstow; }
  const TypeRegistry& types() override { return _types; }
  std::string root() override { return _storage.path(); }

  void makeFolder(const std::string& path) override { _storage.makeFolder(path.substr(1)); }
  void writeFile(const std::string& path, const std::string& content) override {
    _storage.writeFile(path.substr(1), content);
  }
  void makeLink(const std::string& path, const std::string& target) override {
    _storage.makeLink(path.substr(1), target);
  }
  void makeFifo(const std::string& path) override { _storage.makeFifo(path.substr(1)); }
  void move(const std::string& from, const std::string& to) override {
    fs::rename(root() + from, root() + to);
  }
  void remove(const std::string& path) override { fs::remove_all(root() + path); }
  void setMode(const std::string& path, unsigned mode) override {
    fs::permissions(root() + path, static_cast<fs::perms>(mode));
  }
  void catalogue(const std::string& path) override { _index.look(root() + path); }

 private:
  linuxos::TypeFolders declareTypes() {
    _data.makeFolder("mime");
    _data.writeFile("mime/globs2", "50:text/plain:*.txt\n50:text/markdown:*.md\n");
    _data.writeFile("mime/subclasses", "text/markdown text/plain\n");
    _data.writeFile("mime/aliases", "text/x-alias text/markdown\n");
    _data.makeFolder("packages");
    _data.writeFile("packages/p.ini", "[org.example.pouch]\nextensions=pouch;\n");
    return {.dataFolders = {_data.path()}, .packageTypeFolders = {_data.path("packages")}};
  }

  AsOrdinaryUser _ordinary;  // first: everything is made, used and removed as one
  TemporaryFolder _storage;
  TemporaryFolder _data;
  TemporaryFolder _state;
  linuxos::SharedMimeTypes _types;
  Index _index;
  linuxos::LinuxFileSystem _fileSystem;
  linuxos::LinuxExtendedAttributes _attributes;
  linuxos::LinuxVolumes _volumes;
  linuxos::LinuxVerstow _verstow;
};

}  // namespace

std::unique_ptr<Environment> makeLinuxEnvironment() {
  return std::make_unique<LinuxEnvironment>(IndexKind::Fake);
}

std::unique_ptr<Environment> makeCatalogEnvironment() {
  return std::make_unique<LinuxEnvironment>(IndexKind::Catalog);
}

}  // namespace vantrell::testing
