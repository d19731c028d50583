#include "platform/dochost/DochostTags.h"

#include <gtest/gtest.h>

#include "platform/archive/KeyedArchive.h"

namespace vantrell {
namespace {

using Dictionary = ArchiveValue::Dictionary;
using List = ArchiveValue::List;

void expectRoundTrip(const std::vector<DochostTag>& tags) {
  const auto data = dataFromDochostTags(tags);
  ASSERT_TRUE(data) << data.error().description();
  const auto back = dochostTagsFromData(*data);
  ASSERT_TRUE(back) << back.error().description();
  EXPECT_EQ(*back, tags);
}

std::string errorOf(const ArchiveValue& root) {
  const auto tags = dochostTagsFromData(*archivedDataWithRootObject(root));
  return tags ? "no error" : tags.error().message();
}

TEST(DochostTags, TagsComeBackInTheirOrderWithTheirColours) {
  expectRoundTrip({});
  expectRoundTrip({{"Red", 6}, {"grün 😀", std::nullopt}, {"", 0}, {"Red", 6}});
  expectRoundTrip({{std::string(10000, 'x'), UINT64_MAX}});
}

TEST(DochostTags, ALabelThatIsNotUTF8IsRefused) {
  const auto data = dataFromDochostTags({{"\xff", std::nullopt}});
  ASSERT_FALSE(data);
  EXPECT_EQ(data.error().message(), "This cannot be a property list: a string is not UTF-8.");
}

TEST(DochostTags, AnythingElseThanAListOfTagsIsRefused) {
  const std::string none = "The data holds no list of tags.";
  EXPECT_EQ(errorOf(ArchiveValue(std::string("Red"))), none);
  EXPECT_EQ(errorOf(ArchiveValue(Dictionary{})), none);
  EXPECT_EQ(errorOf(ArchiveValue(List{ArchiveValue(std::string("Red"))})), none);
  EXPECT_EQ(errorOf(ArchiveValue(List{ArchiveValue(Dictionary{})})), none);
  EXPECT_EQ(errorOf(ArchiveValue(
                List{ArchiveValue(Dictionary{{"label", ArchiveValue(FndNumber(1UL))}})})),
            none);
  EXPECT_FALSE(dochostTagsFromData({}));
}

TEST(DochostTags, AColourThatIsNoNumberIsNone) {
  const ArchiveValue tag(Dictionary{{"label", ArchiveValue(std::string("Red"))},
                                    {"color", ArchiveValue(std::string("red"))}});
  const auto tags = dochostTagsFromData(*archivedDataWithRootObject(ArchiveValue(List{tag})));
  ASSERT_TRUE(tags);
  EXPECT_EQ(*tags, (std::vector<DochostTag>{{"Red", std::nullopt}}));
}

}  // namespace
}  // namespace vantrell
