#include "linux/catalog/Comparison.h"

#include <gtest/gtest.h>

#include <map>

namespace vantrell::linuxos::catalog {
namespace {

Entry file(std::string name, std::uint64_t number, std::uint64_t generation,
           std::int64_t changed = 100) {
  return {std::move(name), FileID{number}, EntryKind::of(FileKind::RegularFile), generation, 10, 50,
          changed};
}

Entry recent(Entry entry) {
  entry.kind = entry.kind.with(EntryKind::kRecent);
  return entry;
}

class Comparison : public testing::Test {
 protected:
  /// The disk has these generations, by file ID; what has none is gone.
  std::map<std::uint64_t, std::uint64_t> disk;
  int asked = 0;

  std::string compare(std::vector<Entry> catalogued, std::vector<Entry> seen) {
    for (Entry& entry : seen) entry.generation = 0;
    const auto generation = [this](const Entry& entry) -> std::optional<std::uint64_t> {
      ++asked;
      const auto found = disk.find(entry.fileID.value);
      return found == disk.end() ? std::nullopt : std::optional(found->second);
    };
    std::string result;
    for (const Difference& difference : compareEntries(catalogued, seen, generation)) {
      const Entry* const named = difference.after != nullptr ? difference.after : difference.before;
      result += named->name + ":" + "AVRCc"[static_cast<int>(difference.kind)] + " ";
    }
    return result;
  }
};

TEST_F(Comparison, EqualFoldersHaveNoDifferencesAndNobodyIsAsked) {
  EXPECT_EQ(compare({file("a", 1, 7), file("b", 2, 7)}, {file("a", 1, 7), file("b", 2, 7)}), "");
  EXPECT_EQ(asked, 0);
}

TEST_F(Comparison, EmptyFoldersHaveNoDifferences) { EXPECT_EQ(compare({}, {}), ""); }

TEST_F(Comparison, NamesThatComeAndGoAreFoundAtEveryPlace) {
  disk = {{1, 7}, {2, 7}, {3, 7}};
  EXPECT_EQ(compare({}, {file("a", 1, 0), file("b", 2, 0)}), "a:A b:A ");
  EXPECT_EQ(compare({file("a", 1, 7), file("b", 2, 7)}, {}), "a:V b:V ");
  EXPECT_EQ(compare({file("a", 1, 7), file("c", 3, 7)}, {file("b", 2, 0), file("c", 3, 7)}),
            "a:V b:A ");
  EXPECT_EQ(compare({file("b", 2, 7)}, {file("a", 1, 0), file("b", 2, 7), file("c", 3, 0)}),
            "a:A c:A ");
}

TEST_F(Comparison, AnotherNumberIsAnotherObject) {
  disk = {{2, 7}};
  EXPECT_EQ(compare({file("a", 1, 7)}, {file("a", 2, 0)}), "a:R ");
}

TEST_F(Comparison, TheSameNumberWithAnotherGenerationIsAnotherObject) {
  disk = {{1, 8}};
  EXPECT_EQ(compare({file("a", 1, 7)}, {file("a", 1, 0, 101)}), "a:R ");
}

TEST_F(Comparison, AnotherStampOrSizeOfTheSameObjectIsAChange) {
  disk = {{1, 7}};
  EXPECT_EQ(compare({file("a", 1, 7)}, {file("a", 1, 0, 101)}), "a:C ");
  Entry larger = file("a", 1, 0);
  larger.size = 11;
  EXPECT_EQ(compare({file("a", 1, 7)}, {larger}), "a:C ");
  Entry touched = file("a", 1, 0);
  touched.modifiedNanoseconds = 51;
  EXPECT_EQ(compare({file("a", 1, 7)}, {touched}), "a:C ");
}

TEST_F(Comparison, ARowTooRecentToBeTrustedIsConfirmedOrFoundReplaced) {
  disk = {{1, 7}};
  EXPECT_EQ(compare({recent(file("a", 1, 7))}, {file("a", 1, 0)}), "a:c ");
  disk = {{1, 8}};
  EXPECT_EQ(compare({recent(file("a", 1, 7))}, {file("a", 1, 0)}), "a:R ");
}

TEST_F(Comparison, AFileThatBecameAFolderOfTheSameNumberIsReplaced) {
  disk = {{1, 7}};
  Entry folder = file("a", 1, 0);
  folder.kind = EntryKind::of(FileKind::Directory);
  EXPECT_EQ(compare({file("a", 1, 7)}, {folder}), "a:R ");
}

TEST_F(Comparison, AFolderThatBecameAPackageIsAChange) {
  disk = {{1, 7}};
  Entry folder = file("a", 1, 7);
  folder.kind = EntryKind::of(FileKind::Directory);
  Entry package = folder;
  package.kind = folder.kind.with(EntryKind::kPackage);
  EXPECT_EQ(compare({folder}, {package}), "a:C ");
}

TEST_F(Comparison, WhatVanishesBetweenTheTwoCallsIsGoneOrWasNeverThere) {
  EXPECT_EQ(compare({file("a", 1, 7)}, {file("a", 1, 0, 101), file("b", 2, 0)}), "a:V ");
}

TEST_F(Comparison, NamesAreComparedAsBytes) {
  disk = {{1, 7}, {2, 7}};
  EXPECT_EQ(compare({file("a", 3, 7)}, {file("a", 3, 7), file("\x80", 1, 0), file("\xff", 2, 0)}),
            "\x80:A \xff:A ");
}

}  // namespace
}  // namespace vantrell::linuxos::catalog
