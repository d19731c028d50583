// A database that was lost, or brought back from an older copy, misreads no ID: those that were
// told are true or refused, and none is told again for another file.
#include <gtest/gtest.h>

#include <filesystem>
#include <iostream>
#include <random>

#include "PackageTypes.h"
#include "Scenario.h"
#include "Seed.h"
#include "TestStorage.h"
#include "ToldIDs.h"
#include "linux/catalog/Catalog.h"

namespace vantrell::faults {
namespace {

namespace fs = std::filesystem;
using properties::TestStorage;

/// A storage whose state folder is copied, lost and brought back.
class LostDatabase : public ::testing::Test {
 protected:
  void SetUp() override {
    std::cout << "VANTRELL_SEED=" << _seed << "\n";
    _storage.createFolder(copyFolder());
    for (int number = 0; number < 6; ++number) createFile();
  }

  std::string copyFolder() const { return _storage.outside() + "/copy"; }
  std::string databaseIn(const std::string& folder) const { return folder + "/vantrell.db"; }

  void createFile() {
    const std::string path = _storage.root() + "/" + std::to_string(++_names);
    _storage.createFile(path, "content");
    _files.push_back(path);
  }
  /// As programs and people do, each file once: made, saved or renamed.
  void changeFiles() {
    for (std::string& path : _files) {
      const auto choice = _random() % 4;
      if (choice == 0) {
        _storage.createFile(path + ".tmp", "content");
        _storage.moveOver(path + ".tmp", path);
      } else if (choice == 1) {
        const std::string to = _storage.root() + "/" + std::to_string(++_names);
        _storage.moveOver(path, to);
        _promises.renamed(path, to);
        path = to;
      }
    }
    createFile();
  }
  /// Opens the catalog, holds it to its promises, asks for the IDs of some files and closes it.
  void use(bool mayRefuse, std::uint64_t askedFor = 3) {
    auto opened = linuxos::Catalog::open({_storage.state(), {_storage.root()}, _types, {}});
    ASSERT_TRUE(opened) << opened.error().description();
    ASSERT_TRUE((*opened)->look());
    mayRefuse ? _promises.expectKeptOrRefused(**opened) : _promises.expectAllKept(**opened);
    std::vector<linuxos::SeenObject> objects;
    for (const std::string& path : _files) {
      if (_random() % 4 < askedFor) objects.push_back(properties::seeObject(path));
    }
    const FileID root = properties::seeObject(_storage.root()).fileID;
    const auto documentIDs = (*opened)->documentIDsOfObjects(root, objects);
    ASSERT_TRUE(documentIDs) << documentIDs.error().description();
    for (std::size_t at = 0; at < objects.size(); ++at) {
      _promises.told((*documentIDs)[at], objects[at].path);
    }
    EXPECT_EQ(_promises.complaints(), "");
  }

  void loseDatabase() {
    for (const char* suffix : {"", "-wal", "-shm"}) {
      fs::remove(databaseIn(_storage.state()) + suffix);
    }
    _promises.databaseWasLost();
  }
  void loseStateFolder() {
    fs::remove_all(_storage.state());
    _promises.databaseWasLost();
  }
  void copyState() {
    fs::remove_all(copyFolder());
    fs::copy(_storage.state(), copyFolder(), fs::copy_options::recursive);
  }
  void restoreDatabase() {
    loseDatabase();
    for (const char* suffix : {"", "-wal", "-shm"}) {
      const std::string copy = databaseIn(copyFolder()) + suffix;
      if (fs::exists(copy)) fs::copy_file(copy, databaseIn(_storage.state()) + suffix);
    }
  }
  void restoreStateFolder() {
    loseStateFolder();
    fs::copy(copyFolder(), _storage.state(), fs::copy_options::recursive);
  }

  std::uint64_t _seed = seedOrRandom();
  std::mt19937_64 _random{_seed};
  TestStorage _storage{TestStorage::defaultParent()};
  properties::PackageTypes _types;
  std::vector<std::string> _files;
  int _names = 0;
  ToldIDs _promises;
};

TEST_F(LostDatabase, TellsNoIDTwice) {
  use(false);
  for (int time = 0; time < 5; ++time) {
    changeFiles();
    loseDatabase();
    use(true);
  }
  EXPECT_GT(_promises.refused(), 0);
}

TEST_F(LostDatabase, TellsNoIDTwiceWhenTheWholeStateFolderIsLost) {
  if (!properties::stageIn(TestStorage::defaultParent()).takesAttributes) {
    GTEST_SKIP() << "the volume takes no attributes, where the storage would keep the last ID";
  }
  use(false);
  for (int time = 0; time < 5; ++time) {
    changeFiles();
    loseStateFolder();
    use(true);
  }
  EXPECT_GT(_promises.refused(), 0);
}

TEST_F(LostDatabase, AnOlderCopyOfItTellsNoIDTwice) {
  use(false);
  copyState();
  for (int time = 0; time < 10; ++time) {
    changeFiles();
    use(false);
    restoreDatabase();
    use(true);
    if (_random() % 3 == 0) copyState();
  }
  EXPECT_GT(_promises.refused(), 0);
  EXPECT_GT(_promises.kept(), 0);
}

TEST_F(LostDatabase, AnOlderCopyOfTheWholeStateFolderTellsNoIDTwice) {
  if (!properties::stageIn(TestStorage::defaultParent()).takesAttributes) {
    GTEST_SKIP() << "the volume takes no attributes, where the storage would keep the last ID";
  }
  use(false);
  copyState();
  for (int time = 0; time < 10; ++time) {
    changeFiles();
    use(false);
    restoreStateFolder();
    use(true);
    if (_random() % 3 == 0) copyState();
  }
  EXPECT_GT(_promises.refused(), 0);
  EXPECT_GT(_promises.kept(), 0);
}

}  // namespace
}  // namespace vantrell::faults
