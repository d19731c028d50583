#include "tests/contracts/Environment.h"
#include "tests/fakes/FakeExtendedAttributes.h"
#include "tests/fakes/FakeFileSystem.h"
#include "tests/fakes/FakeTypeRegistry.h"
#include "tests/fakes/FakeVerstow.h"
#include "tests/fakes/FakeVolumes.h"

namespace vantrell::testing {
namespace {

class FakeEnvironment : public Environment {
 public:
  FakeEnvironment() {
    _types.declareAlias("text/x-alias", "text/markdown");
    _tree.makeFolder(root());
  }

  FileSystem& fileSystem() override { return _fileSystem; }
  ExtendedAttributes& attributes() override { return _attributes; }
  Volumes& volumes() override { return _volumes; }
  VerstowManager& verstow() override { return _verstow; }
  const TypeRegistry& types() override { return _types; }
  std::string root() override { return "/storage"; }

  void makeFolder(const std::string& path) override { _tree.makeFolder(root() + path); }
  void writeFile(const std::string& path, const std::string& content) override {
    _tree.writeFile(root() + path, content);
  }
  void makeLink(const std::string& path, const std::string& target) override {
    _tree.makeLink(root() + path, target);
  }
  void makeFifo(const std::string& path) override {
    _tree.makeSpecial(root() + path, FileKind::Fifo);
  }
  void move(const std::string& from, const std::string& to) override {
    _tree.move(root() + from, root() + to);
  }
  void remove(const std::string& path) override { _tree.remove(root() + path); }
  void setMode(const std::string& path, unsigned mode) override {
    _tree.setMode(root() + path, mode);
  }
  void catalogue(const std::string&) override {}  // it counts when it is asked

 private:
  FakeTree _tree;
  FakeTypeRegistry _types;
  FakeFileSystem _fileSystem{_tree, _types};
  FakeExtendedAttributes _attributes{_tree};
  FakeVolumes _volumes{_tree};
  FakeVerstow _verstow{_tree, _types};
};

}  // namespace

std::unique_ptr<Environment> makeFakeEnvironment() { return std::make_unique<FakeEnvironment>(); }

}  // namespace vantrell::testing
