#include "items/ItemMetadata.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "items/LocalItem.h"
#include "platform/dochost/DochostTags.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

FndData archived(ArchiveValue value) { return *archivedDataWithRootObject(value); }
ArchiveValue text(std::string value) { return ArchiveValue(std::move(value)); }
ArchiveValue number(std::uint64_t value) { return ArchiveValue(FndNumber(value)); }
ArchiveValue list(ArchiveValue::List values) { return ArchiveValue(std::move(values)); }

class ItemMetadataTest : public testing::Test {
 protected:
  void set(std::string_view attribute, FndData data) {
    system.tree.setAttribute(url.path(), attribute, std::move(data));
  }
  // The tags that the file has by its tag data.
  std::optional<std::vector<DochostTag>> tags() {
    const auto data = readTagData(url);
    if (!data) return std::nullopt;
    return *dochostTagsFromData(*data);
  }

  TestSystem system;
  const FndURL url = system.file("a.txt");
  const FndDate date = FndDate::fromUnixTime(1'600'000'000, 500'000'000);
};

TEST_F(ItemMetadataTest, TheNamesAreFixed) {
  EXPECT_EQ(kLastUsedDateAttribute, "com.quillon.lastuseddate#PS");
  EXPECT_EQ(kTagsAttribute, "com.quillon.metadata:_kMDItemUserTags");
  EXPECT_EQ(kFavoriteRankAttribute, "com.quillon.favorite-rank.number#PS");
  EXPECT_EQ(kTrashTimeAttribute, "com.quillon.trash.time#PS");
  EXPECT_EQ(kPutBackAttribute, "com.quillon.trash.putback#PS");
}

TEST_F(ItemMetadataTest, EachValueIsWrittenAsAKeyedArchiveAndReadBack) {
  EXPECT_TRUE(writeMetadata(url, kLastUsedDateAttribute, ArchiveValue(date)));
  EXPECT_TRUE(writeMetadata(url, kFavoriteRankAttribute, number(UINT64_MAX)));
  EXPECT_TRUE(writeMetadata(url, kTrashTimeAttribute, ArchiveValue(date)));
  EXPECT_TRUE(writeMetadata(url, kPutBackAttribute, text("x/a.txt")));
  EXPECT_EQ(system.tree.attribute(url.path(), kLastUsedDateAttribute),
            archived(ArchiveValue(date)));
  EXPECT_EQ(system.tree.attribute(url.path(), kPutBackAttribute), archived(text("x/a.txt")));
  EXPECT_EQ(readLastUsedDate(url), date);
  EXPECT_EQ(readFavoriteRank(url), UINT64_MAX);
  EXPECT_EQ(readTrashTime(url), date);
  EXPECT_EQ(readPutBackLocation(url), "x/a.txt");
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(ItemMetadataTest, AbsentAttributesAreNoValuesAndNoLines) {
  EXPECT_EQ(readLastUsedDate(url), std::nullopt);
  EXPECT_EQ(readTagData(url), std::nullopt);
  EXPECT_EQ(readFavoriteRank(url), std::nullopt);
  EXPECT_EQ(readTrashTime(url), std::nullopt);
  EXPECT_EQ(readPutBackLocation(url), std::nullopt);
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(ItemMetadataTest, AnAttributeHoldingANumberWhereADateIsExpectedReadsAsNone) {
  set(kLastUsedDateAttribute, archived(number(7)));
  EXPECT_EQ(readLastUsedDate(url), std::nullopt);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error).size(), 1U);
  EXPECT_EQ(LocalItem::init(url)->lastUsedDate(), std::nullopt);
}

TEST_F(ItemMetadataTest, AnAttributeOfAnotherClassReadsAsNone) {
  set(kTagsAttribute, archived(text("alone")));
  set(kFavoriteRankAttribute, archived(text("7")));
  set(kTrashTimeAttribute, archived(text("today")));
  set(kPutBackAttribute, archived(list({text("x")})));
  EXPECT_EQ(readTagData(url), std::nullopt);
  EXPECT_EQ(readFavoriteRank(url), std::nullopt);
  EXPECT_EQ(readTrashTime(url), std::nullopt);
  EXPECT_EQ(readPutBackLocation(url), std::nullopt);
}

TEST_F(ItemMetadataTest, ARankThatIsNoUnsignedIntegerReadsAsNone) {
  for (const FndNumber& value : {FndNumber(std::int64_t{-1}), FndNumber(1.5), FndNumber(true)}) {
    set(kFavoriteRankAttribute, archived(ArchiveValue(value)));
    EXPECT_EQ(readFavoriteRank(url), std::nullopt) << value.description();
  }
}

TEST_F(ItemMetadataTest, AnUndecodableAttributeReadsAsNoneAndIsLeftAlone) {
  for (const FndData& data : {FndData{}, FndData{0}, FndData(3000, 0xff)}) {
    set(kFavoriteRankAttribute, data);
    EXPECT_EQ(readFavoriteRank(url), std::nullopt);
    EXPECT_EQ(system.tree.attribute(url.path(), kFavoriteRankAttribute), data);
  }
}

TEST_F(ItemMetadataTest, TagsWithoutColoursAreTheStoredLabelsInTheirOrder) {
  set(kTagsAttribute, archived(list({text("red"), text(""), text("blue"), text("red")})));
  EXPECT_EQ(tags(), (std::vector<DochostTag>{{"red", {}}, {"", {}}, {"blue", {}}, {"red", {}}}));
}

TEST_F(ItemMetadataTest, AListThatHoldsAListIsNoTags) {
  set(kTagsAttribute, archived(list({text("a"), list({text("b")})})));
  EXPECT_EQ(tags(), std::nullopt);
}

TEST_F(ItemMetadataTest, TagsWithColoursComeBackWithTheSameLabelsAndNoColours) {
  const FndData given = *dataFromDochostTags({{"red", 6}, {"blue", 4}});
  const auto labels = tagLabelsFromTagData(given);
  ASSERT_TRUE(labels);
  EXPECT_TRUE(writeMetadata(url, kTagsAttribute, *labels));
  EXPECT_EQ(tags(), (std::vector<DochostTag>{{"red", {}}, {"blue", {}}}));
  EXPECT_EQ(system.tree.attribute(url.path(), kTagsAttribute),
            archived(list({text("red"), text("blue")})));
}

TEST_F(ItemMetadataTest, DataThatIsNoTagDataHasNoLabels) {
  EXPECT_FALSE(tagLabelsFromTagData(FndData{1, 2}));
  EXPECT_FALSE(tagLabelsFromTagData(archived(list({text("label only")}))));
}

TEST_F(ItemMetadataTest, NoValueRemovesTheAttributeAndAnAbsentOneIsNoFailure) {
  set(kTrashTimeAttribute, archived(ArchiveValue(date)));
  EXPECT_TRUE(writeMetadata(url, kTrashTimeAttribute, std::nullopt));
  EXPECT_EQ(system.tree.attribute(url.path(), kTrashTimeAttribute), std::nullopt);
  EXPECT_TRUE(writeMetadata(url, kTrashTimeAttribute, std::nullopt));
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(ItemMetadataTest, AWriteThatFailsIsAPOSIXErrorAndAnErrorLine) {
  system.tree.faults.failNext(FakeCall::SetAttribute, {FndError::posix(ENOSPC)});
  const auto written = writeMetadata(url, kFavoriteRankAttribute, number(1));
  ASSERT_FALSE(written);
  EXPECT_TRUE(written.error().isPosix(ENOSPC));
  EXPECT_TRUE(written.error().userInfo().empty());
  EXPECT_TRUE(system.log.has(LogLevel::Error,
                             "[ERROR] can't set xattr com.quillon.favorite-rank.number#PS on "
                             "file:///storage/Documents/a.txt; " +
                                 FndError::posix(ENOSPC).description()));
}

TEST_F(ItemMetadataTest, ARemovalThatFailsSaysSo) {
  system.tree.setMode(url.path(), 0400);
  const auto removed = writeMetadata(url, kTrashTimeAttribute, std::nullopt);
  ASSERT_FALSE(removed);
  EXPECT_TRUE(removed.error().isPosix(EACCES));
  EXPECT_TRUE(system.log.has(
      LogLevel::Error,
      "[ERROR] can't remove xattr com.quillon.trash.time#PS on file:///storage/Documents/a.txt; " +
          FndError::posix(EACCES).description()));
}

TEST_F(ItemMetadataTest, AFileThatIsGoneCannotBeWritten) {
  system.tree.remove(url.path());
  const auto written = writeMetadata(url, kFavoriteRankAttribute, number(1));
  ASSERT_FALSE(written);
  EXPECT_TRUE(written.error().isPosix(ENOENT));
}

TEST_F(ItemMetadataTest, ALinkCannotCarryAttributes) {
  system.tree.makeLink(system.inStorage("link"), "a.txt");
  const auto written =
      writeMetadata(system.urlInStorage("link"), kFavoriteRankAttribute, number(1));
  ASSERT_FALSE(written);
  EXPECT_TRUE(written.error().isPosix(EPERM));
  EXPECT_EQ(readFavoriteRank(url), std::nullopt);
}

TEST_F(ItemMetadataTest, AStringThatIsNotUTF8CannotBeWritten) {
  const auto written = writeMetadata(url, kPutBackAttribute, text("\xff"));
  ASSERT_FALSE(written);
  EXPECT_TRUE(written.error().isPosix(EINVAL));
  EXPECT_EQ(system.tree.attribute(url.path(), kPutBackAttribute), std::nullopt);
}

TEST_F(ItemMetadataTest, ARecordShowsTheMetadata) {
  writeMetadata(url, kLastUsedDateAttribute, ArchiveValue(date)).value();
  writeMetadata(url, kFavoriteRankAttribute, number(3)).value();
  writeMetadata(url, kTagsAttribute, list({text("red")})).value();
  const auto item = LocalItem::init(url);
  EXPECT_EQ(item->lastUsedDate(), date);
  EXPECT_EQ(item->favoriteRank(), 3U);
  ASSERT_TRUE(item->tagData());
  EXPECT_EQ(*dochostTagsFromData(*item->tagData()), (std::vector<DochostTag>{{"red", {}}}));
}

}  // namespace
}  // namespace vantrell
