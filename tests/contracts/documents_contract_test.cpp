#include "tests/contracts/ContractTest.h"

namespace vantrell::testing {
namespace {

class VerstowContract : public ContractTest {
 protected:
  DeviceID device() { return *open("", OpenMode::EventOnly)->deviceID(); }
  Result<FileID> resolve(DocumentID documentID) {
    system().verstow().prepare();
    return system().verstow().resolveDocumentID(documentID, device());
  }
};

TEST_P(VerstowContract, ADocumentGetsOneIDAndKeepsIt) {
  system().writeFile("/file", "");
  const DocumentID first = allocate("/file");
  EXPECT_NE(first.value, 0U);
  EXPECT_EQ(allocate("/file"), first);
  EXPECT_EQ(open("/file", OpenMode::EventOnly)->identity()->documentID, first);
}

TEST_P(VerstowContract, NoTwoDocumentsShareAnID) {
  system().writeFile("/a", "");
  system().writeFile("/b", "");
  EXPECT_NE(allocate("/a"), allocate("/b"));
}

TEST_P(VerstowContract, APackageIsADocument) {
  system().makeFolder("/whole.pouch");
  EXPECT_NE(allocate("/whole.pouch").value, 0U);
}

TEST_P(VerstowContract, AnIDLeadsToTheFileThatStandsForTheDocument) {
  system().writeFile("/file", "");
  const DocumentID documentID = allocate("/file");
  EXPECT_EQ(*resolve(documentID), fileID("/file"));
}

TEST_P(VerstowContract, ARenamedDocumentKeepsItsID) {
  system().writeFile("/file", "");
  const DocumentID documentID = allocate("/file");
  system().move("/file", "/renamed");
  EXPECT_EQ(allocate("/renamed"), documentID);
  EXPECT_EQ(*resolve(documentID), fileID("/renamed"));
}

TEST_P(VerstowContract, AnIDThatWasNeverGivenIsENOENT) {
  EXPECT_TRUE(resolve(DocumentID{4'000'000'000}).error().isPosix(ENOENT));
  EXPECT_TRUE(resolve(DocumentID{0}).error().isPosix(ENOENT));
}

TEST_P(VerstowContract, OnAnotherVolumeThereIsNoSuchDocument) {
  system().writeFile("/file", "");
  const DocumentID documentID = allocate("/file");
  const DeviceID other{device().value + 1};
  const auto resolved = system().verstow().resolveDocumentID(documentID, other);
  EXPECT_TRUE(resolved.error().isPosix(ENOENT));
}

TEST_P(VerstowContract, PermanentStorageAllocatesOnlyWhenAskedTo) {
  system().writeFile("/file", "");
  system().verstow().prepare();
  EXPECT_EQ(system().verstow().permanentStorageAtURL(url("/file"), false)->value, 0U);
  const DocumentID made = *system().verstow().permanentStorageAtURL(url("/file"), true);
  EXPECT_NE(made.value, 0U);
  EXPECT_EQ(*system().verstow().permanentStorageAtURL(url("/file"), false), made);
  EXPECT_EQ(allocate("/file"), made);
}

TEST_P(VerstowContract, APlainFolderHasNoPermanentStorage) {
  system().makeFolder("/sub");
  system().verstow().prepare();
  EXPECT_EQ(system().verstow().permanentStorageAtURL(url("/sub"), false)->value, 0U);
}

TEST_P(VerstowContract, NothingThereIsENOENT) {
  system().verstow().prepare();
  const auto stored = system().verstow().permanentStorageAtURL(url("/none"), true);
  EXPECT_TRUE(stored.error().isPosix(ENOENT));
}

VANTRELL_CONTRACT(VerstowContract);

class VolumesContract : public ContractTest {
 protected:
  DeviceID device() { return *open("", OpenMode::EventOnly)->deviceID(); }
};

TEST_P(VolumesContract, EverythingOfTheStorageHasTheSameVolumeUUID) {
  system().makeFolder("/sub");
  system().writeFile("/sub/file", "");
  const auto uuid = system().volumes().volumeUUIDForURL(url(""));
  ASSERT_TRUE(uuid.has_value());
  EXPECT_FALSE(uuid->isZero());
  EXPECT_EQ(*system().volumes().volumeUUIDForURL(url("/sub/file")), *uuid);
  EXPECT_EQ(*system().volumes().volumeUUIDForURL(url("")), *uuid);
}

TEST_P(VolumesContract, AFileIDLeadsToThePathAtWhichItsObjectStandsNow) {
  system().makeFolder("/sub");
  system().writeFile("/sub/file", "");
  const FileID file = fileID("/sub/file");
  EXPECT_EQ(*system().volumes().pathForFileID(device(), file), system().root() + "/sub/file");
  system().move("/sub", "/moved");
  EXPECT_EQ(*system().volumes().pathForFileID(device(), file), system().root() + "/moved/file");
}

TEST_P(VolumesContract, AFileIDThatNothingHasIsENOENT) {
  const auto path = system().volumes().pathForFileID(device(), FileID{~std::uint64_t{0}});
  EXPECT_TRUE(path.error().isPosix(ENOENT));
}

TEST_P(VolumesContract, AnotherVolumeIsENODEV) {
  system().writeFile("/file", "");
  const DeviceID other{device().value + 1};
  const auto path = system().volumes().pathForFileID(other, fileID("/file"));
  EXPECT_TRUE(path.error().isPosix(ENODEV));
}

VANTRELL_CONTRACT(VolumesContract);

}  // namespace
}  // namespace vantrell::testing
