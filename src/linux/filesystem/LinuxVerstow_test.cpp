#include "linux/filesystem/LinuxVerstow.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdio>
#include <filesystem>

#include "linux/filesystem/LinuxOpenFile.h"
#include "linux/types/SharedMimeTypes.h"
#include "tests/contracts/TemporaryFolder.h"
#include "tests/fakes/FakeFileIndex.h"

namespace vantrell::linuxos {
namespace {

using vantrell::testing::TemporaryFolder;

// A file that the manager did not open.
class ForeignFile : public OpenFile {
 public:
  Result<DeviceID> deviceID() override { return DeviceID{1}; }
  Result<FileIdentity> identity() override { return FileIdentity{}; }
  Result<void> setAttribute(std::string_view, FndDataView) override { return {}; }
  Result<void> removeAttribute(std::string_view) override { return {}; }
};

class LinuxVerstowTest : public ::testing::Test {
 protected:
  LinuxVerstowTest()
      : _types({}), _index(_folder.path()), _verstow(_index, _types, _folder.path()) {}

  std::unique_ptr<LinuxOpenFile> open(const std::string& path) {
    return *LinuxOpenFile::open(path, OpenMode::EventOnly, _index, _types);
  }
  const TemporaryFolder& folder() const { return _folder; }
  fakes::FakeFileIndex& index() { return _index; }
  LinuxVerstow& verstow() { return _verstow; }

 private:
  TemporaryFolder _folder;
  SharedMimeTypes _types;
  fakes::FakeFileIndex _index;
  LinuxVerstow _verstow;
};

TEST_F(LinuxVerstowTest, TheIndexIsAskedWithTheFolderOfTheDocument) {
  const std::string sub = folder().makeFolder("sub");
  const auto file = open(folder().writeFile("sub/note"));
  ASSERT_TRUE(verstow().getOrAllocateDocumentID(*file).has_value());
  ASSERT_EQ(index().batches().size(), 1U);
  EXPECT_EQ(index().batches()[0].folder, open(sub)->identity()->fileID);
}

TEST_F(LinuxVerstowTest, AFileMovedAwaySinceItWasOpenedGetsNoIDUnderItsOldPath) {
  const std::string path = folder().writeFile("note");
  const auto file = open(path);
  ASSERT_EQ(std::rename(path.c_str(), folder().path("moved").c_str()), 0);
  EXPECT_TRUE(verstow().getOrAllocateDocumentID(*file).error().isPosix(ENOENT));
  folder().writeFile("note");
  EXPECT_TRUE(verstow().getOrAllocateDocumentID(*file).error().isPosix(ESTALE));
  EXPECT_TRUE(index().batches().empty());
}

TEST_F(LinuxVerstowTest, AFileOpenedByAnotherFileSystemIsRefused) {
  ForeignFile file;
  EXPECT_TRUE(verstow().getOrAllocateDocumentID(file).error().isPosix(EINVAL));
}

TEST_F(LinuxVerstowTest, AFileOnAnotherVolumeGetsNoID) {
  const auto file = open("/proc/version");
  EXPECT_TRUE(verstow().getOrAllocateDocumentID(*file).error().isPosix(EXDEV));
  const auto stored =
      verstow().permanentStorageAtURL(FndURL::fileURLWithPath("/proc/version"), true);
  EXPECT_TRUE(stored.error().isPosix(EXDEV));
  EXPECT_TRUE(index().batches().empty());
}

TEST_F(LinuxVerstowTest, AnErrorOfTheIndexReachesTheCaller) {
  const auto file = open(folder().writeFile("note"));
  index().setBatchError(EROFS);
  EXPECT_TRUE(verstow().getOrAllocateDocumentID(*file).error().isPosix(EROFS));
}

}  // namespace
}  // namespace vantrell::linuxos
