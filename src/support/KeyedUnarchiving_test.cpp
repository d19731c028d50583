#include "support/KeyedUnarchiving.h"

#include <gtest/gtest.h>

#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

class KeyedUnarchivingTest : public testing::Test {
 protected:
  static FndData archived(ArchiveValue value) {
    auto data = archivedDataWithRootObject(value);
    EXPECT_TRUE(data.has_value());
    return *data;
  }
  static ArchiveValue text(std::string value) { return ArchiveValue(std::move(value)); }

  TestSystem system;
  const FndURL source = system.urlInStorage("a.txt");
};

TEST_F(KeyedUnarchivingTest, AnObjectOfTheExpectedClassIsDecoded) {
  const auto value = unarchivedObject(archived(text("words")), ArchiveClass::String, source);
  ASSERT_TRUE(value);
  EXPECT_EQ(*value, text("words"));
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(KeyedUnarchivingTest, AListMayHoldObjectsOfTheSecondClass) {
  const ArchiveValue list(ArchiveValue::List{text("a"), text("b")});
  EXPECT_EQ(unarchivedObject(archived(list), ArchiveClass::List, ArchiveClass::String, source),
            list);
}

TEST_F(KeyedUnarchivingTest, DataThatIsNoArchiveIsAnErrorLineAndYieldsNone) {
  EXPECT_EQ(unarchivedObject(FndData{1, 2, 3}, ArchiveClass::String, source), std::nullopt);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{"[ERROR] got nil while unarchiving object from "
                                     "file:///storage/Documents/a.txt"});
  EXPECT_EQ(system.log.textsAt(LogLevel::Debug).size(), 1U);  // why
}

TEST_F(KeyedUnarchivingTest, EmptyDataYieldsNone) {
  EXPECT_EQ(unarchivedObject(FndData{}, ArchiveClass::String, source), std::nullopt);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error).size(), 1U);
}

TEST_F(KeyedUnarchivingTest, AnObjectOfAClassThatIsNotAllowedYieldsNone) {
  const FndData number = archived(ArchiveValue(FndNumber(std::uint64_t{7})));
  EXPECT_EQ(unarchivedObject(number, ArchiveClass::Date, source), std::nullopt);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error).size(), 1U);
}

TEST_F(KeyedUnarchivingTest, AnAllowedClassThatIsNotTheExpectedOneYieldsNoneAndIsShown) {
  const FndData string = archived(text("alone"));
  EXPECT_EQ(unarchivedObject(string, ArchiveClass::List, ArchiveClass::String, source),
            std::nullopt);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{"[ERROR] got " + text("alone").description() +
                                     " while unarchiving object from "
                                     "file:///storage/Documents/a.txt"});
}

TEST_F(KeyedUnarchivingTest, InvalidResultingClassCarriesBothClassNames) {
  const FndError error = invalidResultingClass("FndDate", "FndNumber");
  ASSERT_NE(error.info<std::string>("expected"), nullptr);
  ASSERT_NE(error.info<std::string>("actual"), nullptr);
  EXPECT_EQ(*error.info<std::string>("expected"), "FndDate");
  EXPECT_EQ(*error.info<std::string>("actual"), "FndNumber");
}

}  // namespace
}  // namespace vantrell
