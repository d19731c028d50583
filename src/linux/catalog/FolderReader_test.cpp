#include "linux/catalog/FolderReader.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <filesystem>

#include "linux/FileDescriptor.h"
#include "linux/catalog/CatalogTestStorage.h"

namespace vantrell::linuxos::catalog {
namespace {

class FolderReaderTest : public CatalogTest {
 protected:
  std::vector<Entry> read(std::string_view folder, FolderRules rules, std::size_t limit = 1000) {
    const FileDescriptor descriptor(::open(path(folder).c_str(), O_RDONLY | O_DIRECTORY));
    EXPECT_TRUE(lookAtDescriptor(descriptor.get(), &rules.device));
    FolderReader reader(descriptor.get(), rules);
    auto entries = reader.next(limit);
    EXPECT_TRUE(entries);
    return entries ? *entries : std::vector<Entry>();
  }
  FolderRules rules() const { return {types, DeviceID{}}; }
  Entry only(std::string_view folder) {
    const auto entries = read(folder, rules());
    EXPECT_EQ(entries.size(), 1U);
    return entries.empty() ? Entry{} : entries.front();
  }

  TesseraTypes types;
};

TEST_F(FolderReaderTest, WhatHasJustChangedIsRecentAndLaterIsNot) {
  makeFolder("folder");
  write("folder/a");
  EXPECT_TRUE(only("folder").kind.isRecent());
  letTimePass();
  EXPECT_FALSE(only("folder").kind.isRecent());
}

TEST_F(FolderReaderTest, EveryKindOfObjectIsTold) {
  write("file");
  makeFolder("folder");
  makeFolder("package.tessera");
  std::filesystem::create_symlink("file", path("symlink"));
  ASSERT_EQ(::mkfifo(path("fifo").c_str(), 0600), 0);
  std::vector<std::pair<std::string, EntryKind>> found;
  for (const Entry& entry : read("", rules())) {
    found.emplace_back(entry.name, entry.kind.without(EntryKind::kRecent));
  }
  const EntryKind directory = EntryKind::of(FileKind::Directory);
  const std::vector<std::pair<std::string, EntryKind>> expected{
      {"fifo", EntryKind::of(FileKind::Fifo)},
      {"file", EntryKind::of(FileKind::RegularFile)},
      {"folder", directory},
      {"package.tessera", directory.with(EntryKind::kPackage)},
      {"symlink", EntryKind::of(FileKind::SymbolicLink)}};
  EXPECT_EQ(found, expected);
}

TEST_F(FolderReaderTest, WhatLiesOnAnotherVolumeIsLeftOut) {
  const FileDescriptor root(::open("/", O_RDONLY | O_DIRECTORY));
  FolderRules ofRoot = rules();
  ASSERT_TRUE(lookAtDescriptor(root.get(), &ofRoot.device));
  const auto proc = FolderReader(root.get(), ofRoot).lookAt("proc");
  ASSERT_TRUE(proc);
  EXPECT_FALSE(proc->has_value());
  write("a");
  EXPECT_EQ(read("", rules()).size(), 1U);
  const FileDescriptor storage(::open(path("").c_str(), O_RDONLY | O_DIRECTORY));
  const auto other = FolderReader(storage.get(), {types, DeviceID{1}}).lookAt("a");
  ASSERT_TRUE(other);
  EXPECT_FALSE(other->has_value());
}

TEST_F(FolderReaderTest, InsideAPackageEverythingIsMarked) {
  makeFolder("p.tessera");
  write("p.tessera/a");
  FolderRules inside = rules();
  inside.isInsidePackage = true;
  const auto entries = read("p.tessera", inside);
  ASSERT_EQ(entries.size(), 1U);
  EXPECT_TRUE(entries.front().kind.isInsidePackage());
  EXPECT_FALSE(entries.front().kind.isDocument());
}

}  // namespace
}  // namespace vantrell::linuxos::catalog
