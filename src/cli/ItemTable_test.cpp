#include "cli/ItemTable.h"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <ctime>

#include "platform/dochost/DochostTags.h"
#include "tests/fakes/FakeItem.h"
#include "tests/fakes/FakeTypeRegistry.h"

namespace vantrell::cli {
namespace {

class ItemTableTest : public testing::Test {
 protected:
  void SetUp() override {
    ::setenv("TZ", "UTC", 1);
    ::tzset();
  }

  std::string lines(std::vector<FakeItem::Fields> items, bool withColor = false) {
    ItemTable table(_types, withColor);
    return table.linesOf(refs(std::move(items)));
  }

  static std::vector<DochostItemRef> refs(std::vector<FakeItem::Fields> items) {
    std::vector<DochostItemRef> result;
    for (auto& fields : items) result.push_back(std::make_shared<FakeItem>(std::move(fields)));
    return result;
  }

  FakeTypeRegistry _types;
};

TEST_F(ItemTableTest, ColumnsAreAligned) {
  EXPECT_EQ(lines({{.itemIdentifier = "did=3",
                    .filename = "a.txt",
                    .documentSize = 1500,
                    .contentModificationDate = FndDate::fromUnixTime(0)},
                   {.itemIdentifier = "fid=1234",
                    .filename = "Letters",
                    .typeIdentifier = std::string(kFolderTypeIdentifier),
                    .childItemCount = 12}}),
            "did=3     file       1.5 kB  1970-01-01 00:00  a.txt\n"
            "fid=1234  folder   12 items  -                 Letters\n");
}

TEST_F(ItemTableTest, EveryKindHasItsWord) {
  const auto kindOf = [this](std::string type) {
    const std::string line = lines({{.typeIdentifier = std::move(type)}});
    return line.substr(7, line.find(' ', 7) - 7);
  };
  EXPECT_EQ(kindOf("text/plain"), "file");
  EXPECT_EQ(kindOf("inode/directory"), "folder");
  EXPECT_EQ(kindOf("inode/symlink"), "link");
  EXPECT_EQ(kindOf("inode/fifo"), "fifo");
  EXPECT_EQ(kindOf("com.quillon.tessera.document"), "package");
}

TEST_F(ItemTableTest, ALaterPageIsNoNarrower) {
  ItemTable table(_types, false);
  (void)table.linesOf(refs({{.itemIdentifier = "did=1000000"}}));
  EXPECT_EQ(table.linesOf(refs({{.itemIdentifier = "did=1"}})).find("file"), 13U);
}

TEST_F(ItemTableTest, TagsFollowTheName) {
  EXPECT_TRUE(lines({{.tagData = dataFromDochostTags({{"Work", {}}, {"a\tb", {}}}).value()}})
                  .ends_with("a.txt  [Work, a\\x09b]\n"));
  EXPECT_TRUE(lines({{.tagData = dataFromDochostTags({}).value()}}).ends_with("a.txt\n"));
}

TEST_F(ItemTableTest, ANameCannotSpeakToTheTerminal) {
  EXPECT_TRUE(lines({{.filename = "\x1b]0;x\x07\n"}}).ends_with("\\x1B]0;x\\x07\\x0A\n"));
}

TEST_F(ItemTableTest, ColorIsPutAroundTheNameOnlyWhenItIsWanted) {
  const FakeItem::Fields folder{.filename = "F",
                                .typeIdentifier = std::string(kFolderTypeIdentifier)};
  EXPECT_TRUE(lines({folder}, true).ends_with("\x1b[1;34mF\x1b[0m\n"));
  EXPECT_EQ(lines({folder}).find('\x1b'), std::string::npos);
  EXPECT_EQ(lines({{}}, true).find('\x1b'), std::string::npos);
}

TEST(ByteCount, UnitsAreThousands) {
  EXPECT_EQ(textOfByteCount(0), "0 B");
  EXPECT_EQ(textOfByteCount(999), "999 B");
  EXPECT_EQ(textOfByteCount(1000), "1.0 kB");
  EXPECT_EQ(textOfByteCount(999949), "999.9 kB");
  EXPECT_EQ(textOfByteCount(999999), "1.0 MB");
  EXPECT_EQ(textOfByteCount(18446744073709551615U), "18.4 EB");
}

}  // namespace
}  // namespace vantrell::cli
