#include "linux/filesystem/LinuxOpenFile.h"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

#include "linux/types/SharedMimeTypes.h"
#include "tests/contracts/TemporaryFolder.h"
#include "tests/fakes/FakeFileIndex.h"

namespace vantrell::linuxos {
namespace {

using testing::AsOrdinaryUser;
using testing::rawAttribute;

FndDataView view(const std::string& text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

class LinuxOpenFileTest : public ::testing::Test {
 protected:
  LinuxOpenFileTest() : _types(declarePackages()), _index(_folder.path()) {}

  Result<std::unique_ptr<LinuxOpenFile>> open(const std::string& path, OpenMode mode) {
    return LinuxOpenFile::open(path, mode, _index, _types);
  }
  std::unique_ptr<LinuxOpenFile> opened(const std::string& path, OpenMode mode) {
    auto file = open(path, mode);
    if (!file) throw std::runtime_error(file.error().description());
    return *std::move(file);
  }
  const vantrell::testing::TemporaryFolder& folder() const { return _folder; }
  fakes::FakeFileIndex& index() { return _index; }

 private:
  TypeFolders declarePackages() {
    _declarations.writeFile("p.ini", "[test.package]\nextensions=pkg;\n");
    return {.dataFolders = {}, .packageTypeFolders = {_declarations.path()}};
  }

  vantrell::testing::TemporaryFolder _folder;
  vantrell::testing::TemporaryFolder _declarations;
  SharedMimeTypes _types;
  fakes::FakeFileIndex _index;
};

TEST_F(LinuxOpenFileTest, OpeningAFifoOrASocketDoesNotBlock) {
  for (const std::string& path : {folder().makeFifo("fifo"), folder().makeSocket("socket")}) {
    for (const OpenMode mode : {OpenMode::EventOnly, OpenMode::ReadOnly, OpenMode::ReadWrite}) {
      EXPECT_TRUE(open(path, mode).has_value()) << path;
    }
  }
}

TEST_F(LinuxOpenFileTest, ALinkAtTheEndIsOpenedItself) {
  const std::string link = folder().makeLink("link", folder().writeFile("file"));
  EXPECT_EQ(opened(link, OpenMode::EventOnly)->identity()->kind, FileKind::SymbolicLink);
}

TEST_F(LinuxOpenFileTest, ALinkInThePathIsRefused) {
  folder().makeFolder("real");
  folder().writeFile("real/file");
  folder().makeLink("link", folder().path("real"));
  const auto file = open(folder().path("link/file"), OpenMode::EventOnly);
  ASSERT_FALSE(file.has_value());
  EXPECT_TRUE(file.error().isPosix(ELOOP)) << file.error().description();
}

TEST_F(LinuxOpenFileTest, NothingThereIsSaidAsSuch) {
  EXPECT_TRUE(open(folder().path("none"), OpenMode::EventOnly).error().isPosix(ENOENT));
}

TEST_F(LinuxOpenFileTest, AnAttributeLandsInTheUsersNamespaceAndTheIndexHearsOfIt) {
  const std::string path = folder().writeFile("file");
  auto file = opened(path, OpenMode::ReadWrite);
  ASSERT_TRUE(file->setAttribute("com.quillon.x#PS", view("value")).has_value());
  EXPECT_EQ(rawAttribute(path, "user.com.quillon.x#PS"), "value");
  ASSERT_EQ(index().notedAttributes().size(), 1U);
  EXPECT_EQ(index().notedAttributes()[0].name, "com.quillon.x#PS");
  EXPECT_EQ(index().notedAttributes()[0].fileID, file->identity()->fileID);
  EXPECT_EQ(index().notedAttributes()[0].value, (FndData{'v', 'a', 'l', 'u', 'e'}));

  ASSERT_TRUE(file->removeAttribute("com.quillon.x#PS").has_value());
  EXPECT_EQ(rawAttribute(path, "user.com.quillon.x#PS"), "(none)");
  ASSERT_EQ(index().notedAttributes().size(), 2U);
  EXPECT_EQ(index().notedAttributes()[1].value, std::nullopt);
}

TEST_F(LinuxOpenFileTest, AFolderTakesAttributes) {
  const std::string path = folder().makeFolder("sub");
  ASSERT_TRUE(opened(path, OpenMode::ReadWrite)->setAttribute("a", view("1")).has_value());
  EXPECT_EQ(rawAttribute(path, "user.a"), "1");
}

TEST_F(LinuxOpenFileTest, OnlyAFileOpenedForWritingTakesAttributes) {
  const std::string path = folder().writeFile("file");
  for (const OpenMode mode : {OpenMode::EventOnly, OpenMode::ReadOnly}) {
    auto file = opened(path, mode);
    EXPECT_TRUE(file->setAttribute("a", view("1")).error().isPosix(EACCES));
    EXPECT_TRUE(file->removeAttribute("a").error().isPosix(EACCES));
  }
  EXPECT_EQ(rawAttribute(path, "user.a"), "(none)");
  EXPECT_TRUE(index().notedAttributes().empty());
}

TEST_F(LinuxOpenFileTest, AReadOnlyFileCannotBeOpenedForWritingByAnOrdinaryUser) {
  const AsOrdinaryUser ordinary;
  const std::string path = folder().writeFile("file");
  ASSERT_EQ(::chmod(path.c_str(), 0444), 0);
  EXPECT_TRUE(open(path, OpenMode::ReadWrite).error().isPosix(EACCES));
  EXPECT_TRUE(open(path, OpenMode::ReadOnly).has_value());
}

TEST_F(LinuxOpenFileTest, WhatMayNotBeReadCanBeLookedAt) {
  const AsOrdinaryUser ordinary;
  const std::string path = folder().writeFile("file");
  ASSERT_EQ(::chmod(path.c_str(), 0000), 0);
  EXPECT_EQ(opened(path, OpenMode::EventOnly)->identity()->kind, FileKind::RegularFile);
}

TEST_F(LinuxOpenFileTest, LinksFifosAndSocketsCarryNoAttributes) {
  const std::string target = folder().writeFile("file");
  for (const std::string& path : {folder().makeLink("link", target), folder().makeFifo("fifo"),
                                  folder().makeSocket("socket")}) {
    const auto set = opened(path, OpenMode::ReadWrite)->setAttribute("a", view("1"));
    ASSERT_FALSE(set.has_value()) << path;
    EXPECT_TRUE(set.error().isPosix(EPERM)) << path << set.error().description();
  }
  EXPECT_EQ(rawAttribute(target, "user.a"), "(none)");
  EXPECT_TRUE(index().notedAttributes().empty());
}

TEST_F(LinuxOpenFileTest, AValueTooLargeIsRefusedAndTheOldOneStays) {
  const std::string path = folder().writeFile("file");
  auto file = opened(path, OpenMode::ReadWrite);
  ASSERT_TRUE(file->setAttribute("a", view("old")).has_value());
  const auto set = file->setAttribute("a", view(std::string(65537, 'x')));
  ASSERT_FALSE(set.has_value());
  EXPECT_TRUE(set.error().isPosix(E2BIG) || set.error().isPosix(ENOSPC))
      << set.error().description();
  EXPECT_EQ(rawAttribute(path, "user.a"), "old");
  EXPECT_EQ(index().notedAttributes().size(), 1U);
}

TEST_F(LinuxOpenFileTest, AValueThatTheVolumeHasNoRoomForIsRefusedAndTheOldOneStays) {
  const std::string path = folder().writeFile("file");
  auto file = opened(path, OpenMode::ReadWrite);
  ASSERT_TRUE(file->setAttribute("a", view("old")).has_value());
  const std::string large(60000, 'x');  // more than a block of most volumes
  const auto set = file->setAttribute("a", view(large));
  EXPECT_EQ(rawAttribute(path, "user.a"), set ? large : "old");
  EXPECT_TRUE(set || set.error().isPosix(ENOSPC)) << set.error().description();
}

TEST_F(LinuxOpenFileTest, AnAttributeThatIsNotThereCannotBeRemoved) {
  auto file = opened(folder().writeFile("file"), OpenMode::ReadWrite);
  EXPECT_TRUE(file->removeAttribute("a").error().isPosix(ENODATA));
  EXPECT_TRUE(index().notedAttributes().empty());
}

TEST_F(LinuxOpenFileTest, ANameThatNoAttributeCanHaveIsRefused) {
  auto file = opened(folder().writeFile("file"), OpenMode::ReadWrite);
  for (const std::string& name : {std::string(), std::string("a\0b", 3)}) {
    EXPECT_TRUE(file->setAttribute(name, view("1")).error().isPosix(EINVAL));
    EXPECT_TRUE(file->removeAttribute(name).error().isPosix(EINVAL));
  }
}

TEST_F(LinuxOpenFileTest, IdentityTellsKindAndNumbersOfWhatWasOpened) {
  const std::string path = folder().writeFile("file");
  struct stat status;
  ASSERT_EQ(::lstat(path.c_str(), &status), 0);
  auto file = opened(path, OpenMode::EventOnly);
  EXPECT_EQ(file->identity()->fileID.value, status.st_ino);
  EXPECT_EQ(file->identity()->documentID.value, 0U);
  EXPECT_EQ(*file->deviceID(), deviceID(major(status.st_dev), minor(status.st_dev)));

  const SeenObject object = *file->seen();
  const DocumentID given = index().documentIDsOfObjects({}, {&object, 1})->front();
  EXPECT_EQ(file->identity()->documentID, given);
}

TEST_F(LinuxOpenFileTest, IdentityTellsTheIndexWhatWasSeen) {
  const std::string path = folder().makeFolder("sub.pkg");
  ASSERT_TRUE(opened(path, OpenMode::EventOnly)->identity().has_value());
  ASSERT_EQ(index().seenObjects().size(), 1U);
  EXPECT_EQ(index().seenObjects()[0].path, path);
  EXPECT_TRUE(index().seenObjects()[0].isPackage);
}

TEST_F(LinuxOpenFileTest, AnOpenedFileKeepsItsIdentityWhenItIsRenamed) {
  const std::string path = folder().writeFile("file");
  auto file = opened(path, OpenMode::ReadWrite);
  const FileID before = file->identity()->fileID;
  ASSERT_EQ(std::rename(path.c_str(), folder().path("renamed").c_str()), 0);
  EXPECT_EQ(file->identity()->fileID, before);
  ASSERT_TRUE(file->setAttribute("a", view("1")).has_value());
  EXPECT_EQ(rawAttribute(folder().path("renamed"), "user.a"), "1");
}

TEST_F(LinuxOpenFileTest, SeenNoticesThatThePathLeadsElsewhereByNow) {
  const std::string path = folder().writeFile("file");
  auto file = opened(path, OpenMode::EventOnly);
  EXPECT_EQ(file->seen()->path, path);
  ASSERT_EQ(std::rename(path.c_str(), folder().path("renamed").c_str()), 0);
  EXPECT_TRUE(file->seen().error().isPosix(ENOENT));
  folder().writeFile("file");
  EXPECT_TRUE(file->seen().error().isPosix(ESTALE));
}

}  // namespace
}  // namespace vantrell::linuxos
