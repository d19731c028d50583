// What a catalog has told is true after it was killed.
#include <gtest/gtest.h>

#include "KillLoop.h"
#include "PackageTypes.h"
#include "TestStorage.h"
#include "ToldIDs.h"
#include "linux/catalog/Catalog.h"

namespace vantrell::faults {
namespace {

TEST(KilledCatalog, KeepsEveryIDItTold) { killOftenAndJudge(10); }

/// Two files with IDs, and the judge that was told them; the judge is what is tested here.
class PromiseJudge : public ::testing::Test {
 protected:
  void SetUp() override {
    _storage.createFile(pathA(), "a");
    _storage.createFile(pathB(), "b");
    auto opened = linuxos::Catalog::open({_storage.state(), {_storage.root()}, _types, {}});
    ASSERT_TRUE(opened) << opened.error().description();
    _catalog = std::move(*opened);
    ASSERT_TRUE(_catalog->look());
    const std::vector<linuxos::SeenObject> objects = {properties::seeObject(pathA()),
                                                      properties::seeObject(pathB())};
    const FileID root = properties::seeObject(_storage.root()).fileID;
    const auto documentIDs = _catalog->documentIDsOfObjects(root, objects);
    ASSERT_TRUE(documentIDs) << documentIDs.error().description();
    _idA = documentIDs->front();
    _idB = documentIDs->back();
  }
  std::string pathA() const { return _storage.root() + "/a"; }
  std::string pathB() const { return _storage.root() + "/b"; }
  static std::string told(DocumentID documentID, const std::string& path) {
    return "T " + std::to_string(documentID.value) + " " + path + "\n";
  }

  properties::TestStorage _storage{properties::TestStorage::defaultParent()};
  properties::PackageTypes _types;
  std::unique_ptr<linuxos::Catalog> _catalog;
  DocumentID _idA;
  DocumentID _idB;
  ToldIDs _promises;
};

TEST_F(PromiseJudge, IsContentWithPromisesKept) {
  _promises.read(told(_idA, pathA()) + told(_idB, pathB()) + "T 99 " + pathA());
  _promises.expectAllKept(*_catalog);
  EXPECT_EQ(_promises.complaints(), "");
  EXPECT_EQ(_promises.kept(), 2);
}

TEST_F(PromiseJudge, NoticesIDsThatChangedPlaces) {
  _promises.read(told(_idA, pathB()) + told(_idB, pathA()));
  _promises.expectKeptOrRefused(*_catalog);
  EXPECT_NE(_promises.complaints(), "");
}

TEST_F(PromiseJudge, NoticesAnIDThatWasLost) {
  _promises.read(told(DocumentID{_idB.value + 1000}, pathA()));
  _promises.expectAllKept(*_catalog);
  EXPECT_NE(_promises.complaints(), "");
}

TEST_F(PromiseJudge, NoticesAnIDToldForTwoFiles) {
  _promises.read(told(_idA, pathA()) + told(_idA, pathB()));
  EXPECT_NE(_promises.complaints(), "");
}

TEST_F(PromiseJudge, NoticesAFileThatWasToldTwoIDs) {
  _promises.read(told(_idA, pathA()) + told(_idB, pathA()));
  EXPECT_NE(_promises.complaints(), "");
}

}  // namespace
}  // namespace vantrell::faults
