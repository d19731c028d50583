#include "platform/dochost/DhURLOperations.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

using enum DhURLRelationship;

FndURL file(std::string_view path) { return FndURL::fileURLWithPath(path); }

TEST(DhURLOperations, ARelationshipIsToldFromThePaths) {
  const struct {
    const char* folder;
    const char* item;
    DhURLRelationship relationship;
  } kRows[] = {
      {"/a", "/a/b", Contains},   {"/a", "/a/b/c", Contains},
      {"/a", "/a", Same},         {"/a/", "/a", Same},
      {"/a", "/ab", Other},       {"/a", "/ab/c", Other},
      {"/ab", "/a", Other},       {"/a/b", "/a", Other},
      {"/a", "/b/a", Other},      {"/", "/a", Contains},
      {"/", "/", Same},           {"/a", "/", Other},
      {"/a", "/A/b", Other},      {"/a", "/a/.../b", Contains},
      {"/a", "/a/..b", Contains}, {"/a", "/a/\xff", Contains},
  };
  for (const auto& row : kRows) {
    EXPECT_EQ(dh_relationshipToItemAtURL(file(row.folder), file(row.item)), row.relationship)
        << row.folder << " " << row.item;
  }
}

TEST(DhURLOperations, APathWithDoubleDotsIsMadeCanonicalFirst) {
  TestSystem system;
  system.tree.makeFolder("/a/b");
  system.tree.makeFolder("/c/d");
  system.tree.makeLink("/a/link", "/c/d");
  EXPECT_EQ(dh_relationshipToItemAtURL(file("/a"), file("/a/../c/d")), Other);
  EXPECT_EQ(dh_relationshipToItemAtURL(file("/c"), file("/a/../c/d")), Contains);
  EXPECT_EQ(dh_relationshipToItemAtURL(file("/a"), file("/a/b/..")), Same);
  EXPECT_EQ(dh_relationshipToItemAtURL(file("/a/../c"), file("/c/d")), Contains);
  // Behind a link ".." leads elsewhere than the text says.
  EXPECT_EQ(dh_relationshipToItemAtURL(file("/a"), file("/a/link/..")), Other);
  EXPECT_EQ(dh_relationshipToItemAtURL(file("/c"), file("/a/link/..")), Same);
}

TEST(DhURLOperations, URLsOfOtherSchemesAreTheSameOrHaveNoRelationship) {
  const FndURL web = *FndURL::URLWithString("https://host/a");
  EXPECT_EQ(dh_relationshipToItemAtURL(web, web), Same);
  EXPECT_EQ(dh_relationshipToItemAtURL(web, *FndURL::URLWithString("https://host/a/b")), Other);
  EXPECT_EQ(dh_relationshipToItemAtURL(file("/"), web), Other);
  EXPECT_EQ(dh_relationshipToItemAtURL(web, file("/")), Other);
}

TEST(DhURLOperations, OnlyADirectoryThatIsNoPackageIsAFolder) {
  TestSystem system;
  EXPECT_TRUE(dh_isFolder(system.folder("folder")));
  EXPECT_FALSE(dh_isFolder(system.file("file.txt")));
  EXPECT_FALSE(dh_isFolder(TestSystem::urlInStorage("missing")));
  EXPECT_FALSE(dh_isFolder(*FndURL::URLWithString("https://host/a")));
}

TEST(DhURLOperations, ReadWriteAccessHandsOverTheOpenFileAndItsErrors) {
  TestSystem system;
  const FndURL url = system.file("file.txt");
  const auto done = dh_withReadWriteAccess(
      url, [](OpenFile& opened) { return opened.setAttribute("name", FndData{1}); });
  EXPECT_TRUE(done);
  EXPECT_EQ(system.tree.attribute(url.path(), "name"), FndData{1});
  const auto failed = dh_withReadWriteAccess(
      url, [](OpenFile& opened) { return opened.removeAttribute("another"); });
  ASSERT_FALSE(failed);
  EXPECT_TRUE(failed.error().isPosix(ENODATA));
}

TEST(DhURLOperations, NoWorkIsDoneOnWhatCannotBeOpenedForWriting) {
  TestSystem system;
  const FndURL url = system.file("file.txt");
  system.tree.setMode(url.path(), 0400);
  bool worked = false;
  const auto work = [&worked](OpenFile&) -> Result<void> {
    worked = true;
    return {};
  };
  const auto refused = dh_withReadWriteAccess(url, work);
  ASSERT_FALSE(refused);
  EXPECT_TRUE(refused.error().isPosix(EACCES));
  const auto missing = dh_withReadWriteAccess(TestSystem::urlInStorage("missing"), work);
  ASSERT_FALSE(missing);
  EXPECT_TRUE(missing.error().isPosix(ENOENT));
  EXPECT_FALSE(worked);
}

}  // namespace
}  // namespace vantrell
