#include <gtest/gtest.h>

#include <cerrno>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "items/ItemMetadata.h"
#include "platform/dochost/DochostTags.h"
#include "tests/support/ProviderTest.h"

namespace vantrell {
namespace {

class MetadataTest : public ProviderTest {
 protected:
  struct Answer {
    int completions = 0;
    DochostItemRef item;
    std::optional<FndError> error;
  };
  // Keeps the one answer of a request.
  static DochostExtension::ItemCompletion into(Answer& answer) {
    return [&answer](DochostItemRef item, std::optional<FndError> error) {
      ++answer.completions;
      answer.item = std::move(item);
      answer.error = std::move(error);
    };
  }
  Answer setDate(std::optional<FndDate> value, std::string_view to) {
    Answer answer;
    extension->setLastUsedDate_forItemIdentifier_completionHandler(value, to, into(answer));
    EXPECT_EQ(answer.completions, 1);
    return answer;
  }
  Answer setTags(std::optional<FndData> value, std::string_view to) {
    Answer answer;
    extension->setTagData_forItemIdentifier_completionHandler(std::move(value), to, into(answer));
    EXPECT_EQ(answer.completions, 1);
    return answer;
  }
  Answer setRank(std::optional<std::uint64_t> value, std::string_view to) {
    Answer answer;
    extension->setFavoriteRank_forItemIdentifier_completionHandler(value, to, into(answer));
    EXPECT_EQ(answer.completions, 1);
    return answer;
  }
  static FndData tagData(std::vector<DochostTag> tags) { return *dataFromDochostTags(tags); }
  std::optional<FndData> attribute(std::string_view name) {
    return system.tree.attribute(url.path(), name);
  }
  static FndData archived(ArchiveValue value) { return *archivedDataWithRootObject(value); }

  const FndURL url = system.file("a.txt");
  const std::string identifier = *itemIdentifier(system.urlInStorage("a.txt"));
  const FndDate date = FndDate::fromUnixTime(1'600'000'000);
};

TEST_F(MetadataTest, ALastUsedDateIsStoredAndComesBackInTheFreshRecord) {
  const Answer answer = setDate(date, identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  ASSERT_NE(answer.item, nullptr);
  EXPECT_EQ(answer.item->lastUsedDate(), date);
  EXPECT_EQ(attribute(kLastUsedDateAttribute), archived(ArchiveValue(date)));
  EXPECT_TRUE(
      hasSection("set last used date \"2020-09-13T12:26:40Z\" to item \"" + identifier + "\""));
}

TEST_F(MetadataTest, SettingTheLastUsedDateToNoneClearsTheAttributeAndLogsTheClearingSectionText) {
  setDate(date, identifier);
  const Answer answer = setDate(std::nullopt, identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  EXPECT_EQ(answer.item->lastUsedDate(), std::nullopt);
  EXPECT_EQ(attribute(kLastUsedDateAttribute), std::nullopt);
  EXPECT_TRUE(hasSection("clearing last used date for item \"" + identifier + "\""));
}

TEST_F(MetadataTest, AFailedLastUsedDateWriteNeverFailsTheRequest) {
  system.tree.setMode(url.path(), 0400);
  const Answer answer = setDate(date, identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  ASSERT_NE(answer.item, nullptr);
  EXPECT_EQ(answer.item->lastUsedDate(), std::nullopt);
  EXPECT_TRUE(hasLine(LogLevel::Error,
                      "[ERROR] can't set xattr com.quillon.lastuseddate#PS on "
                      "file:///storage/Documents/a.txt; " +
                          FndError::posix(EACCES).description()));
}

TEST_F(MetadataTest, TagsAreStoredAsTheirLabelsInOrder) {
  const Answer answer = setTags(tagData({{"red", 6}, {"work", {}}, {"red", 1}}), identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  ASSERT_NE(answer.item, nullptr);
  EXPECT_EQ(answer.item->tagData(), tagData({{"red", {}}, {"work", {}}, {"red", {}}}));
  ArchiveValue::List labels{ArchiveValue(std::string("red")), ArchiveValue(std::string("work")),
                            ArchiveValue(std::string("red"))};
  EXPECT_EQ(attribute(kTagsAttribute), archived(ArchiveValue(std::move(labels))));
  EXPECT_TRUE(hasSection("set tag data to item \"" + identifier + "\""));
}

TEST_F(MetadataTest, TagDataWithNoTagsStoresAnEmptyListOfLabels) {
  const Answer answer = setTags(tagData({}), identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  EXPECT_EQ(attribute(kTagsAttribute), archived(ArchiveValue(ArchiveValue::List{})));
  EXPECT_EQ(answer.item->tagData(), tagData({}));
}

TEST_F(MetadataTest, NoTagDataClearsTheAttribute) {
  setTags(tagData({{"red", {}}}), identifier);
  const Answer answer = setTags(std::nullopt, identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  EXPECT_EQ(attribute(kTagsAttribute), std::nullopt);
  EXPECT_EQ(answer.item->tagData(), std::nullopt);
}

TEST_F(MetadataTest, AFailedTagWriteIsReportedAlongsideTheRecord) {
  system.tree.setAttributeCapacity(100);
  const Answer answer = setTags(tagData({{std::string(200, 'x'), {}}}), identifier);
  ASSERT_TRUE(answer.error);
  EXPECT_TRUE(answer.error->isPosix(ENOSPC));
  ASSERT_NE(answer.item, nullptr);
  EXPECT_EQ(answer.item->itemIdentifier(), identifier);
  EXPECT_EQ(attribute(kTagsAttribute), std::nullopt);
  EXPECT_TRUE(hasLine(LogLevel::Error,
                      "[ERROR] can't set xattr com.quillon.metadata:_kMDItemUserTags on "
                      "file:///storage/Documents/a.txt; " +
                          FndError::posix(ENOSPC).description()));
}

TEST_F(MetadataTest, DataThatIsNoTagDataIsAnErrorAndChangesNothing) {
  setTags(tagData({{"red", {}}}), identifier);
  const auto before = attribute(kTagsAttribute);
  const Answer answer = setTags(FndData{1, 2, 3}, identifier);
  ASSERT_TRUE(answer.error);
  EXPECT_TRUE(answer.error->is(kVantrellErrorDomain,
                               static_cast<std::int64_t>(VantrellErrorCode::DamagedData)));
  EXPECT_NE(answer.item, nullptr);
  EXPECT_EQ(attribute(kTagsAttribute), before);
}

TEST_F(MetadataTest, ATagRequestForAnIdentifierWithoutAURLSaysSoAndHasNoItem) {
  const Answer answer = setTags(tagData({}), "did=999");
  EXPECT_EQ(answer.item, nullptr);
  ASSERT_TRUE(answer.error);
  expectNoSuchItem(*answer.error, "did=999");
  EXPECT_TRUE(hasLine(LogLevel::Error, "[ERROR] can't find URL for item; did=999"));
  EXPECT_TRUE(hasSection("set tag data to item \"did=999\""));
}

TEST_F(MetadataTest, TheOtherRequestsForAnIdentifierWithoutAURLFailWithTheLookupsError) {
  for (const Answer& answer : {setDate(date, "did=999"), setRank(1, "did=999")}) {
    EXPECT_EQ(answer.item, nullptr);
    ASSERT_TRUE(answer.error);
    expectNoSuchItem(*answer.error, "did=999");
  }
  EXPECT_FALSE(hasLine(LogLevel::Error, "[ERROR] can't find URL for item; did=999"));
}

TEST_F(MetadataTest, AFavoriteRankIsStoredAndComesBackInTheFreshRecord) {
  const Answer answer = setRank(UINT64_MAX, identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  ASSERT_NE(answer.item, nullptr);
  EXPECT_EQ(answer.item->favoriteRank(), UINT64_MAX);
  EXPECT_EQ(attribute(kFavoriteRankAttribute), archived(ArchiveValue(FndNumber(UINT64_MAX))));
  EXPECT_TRUE(
      hasSection("set favorite rank \"18446744073709551615\" to item \"" + identifier + "\""));
}

TEST_F(MetadataTest, AFavoriteRankOfNoneShowsAsNilInTheLogAndClearsTheAttribute) {
  setRank(5, identifier);
  const Answer answer = setRank(std::nullopt, identifier);
  EXPECT_EQ(answer.error, std::nullopt);
  EXPECT_EQ(answer.item->favoriteRank(), std::nullopt);
  EXPECT_EQ(attribute(kFavoriteRankAttribute), std::nullopt);
  EXPECT_TRUE(hasSection("set favorite rank \"nil\" to item \"" + identifier + "\""));
}

TEST_F(MetadataTest, AFailedFavoriteRankWriteIsReportedAlongsideTheRecord) {
  system.tree.setMode(url.path(), 0400);
  const Answer answer = setRank(5, identifier);
  ASSERT_TRUE(answer.error);
  EXPECT_TRUE(answer.error->isPosix(EACCES));
  ASSERT_NE(answer.item, nullptr);
  EXPECT_EQ(answer.item->favoriteRank(), std::nullopt);
}

TEST_F(MetadataTest, AnItemThatIsGoneAfterTheWriteAnswersWithTheLookupsError) {
  // The first look-up of a place succeeds, and the one for the fresh record finds none.
  system.tree.faults.failAfter(FakeCall::PathForFileID, 1, FndError::posix(ENOENT));
  const Answer answer = setRank(5, identifier);
  EXPECT_EQ(answer.item, nullptr);
  ASSERT_TRUE(answer.error);
  expectNoSuchItem(*answer.error, identifier);
}

TEST_F(MetadataTest, AFolderCarriesMetadataToo) {
  const std::string folder = *itemIdentifier(system.folder("folder"));
  const Answer answer = setRank(7, folder);
  EXPECT_EQ(answer.error, std::nullopt);
  EXPECT_EQ(answer.item->favoriteRank(), 7U);
}

TEST_F(MetadataTest, MetadataTravelsWithRenamesAndReplacingSaves) {
  setRank(7, identifier);
  setTags(tagData({{"red", {}}}), identifier);
  system.tree.move(url.path(), system.inStorage("b.txt"));
  system.tree.saveByReplacing(system.inStorage("b.txt"), "new");
  const auto item = extension->itemForIdentifier_error(identifier);
  ASSERT_TRUE(item);
  EXPECT_EQ((*item)->filename(), "b.txt");
  EXPECT_EQ((*item)->favoriteRank(), 7U);
  EXPECT_EQ((*item)->tagData(), tagData({{"red", {}}}));
}

}  // namespace
}  // namespace vantrell
