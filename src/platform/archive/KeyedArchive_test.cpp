#include "platform/archive/KeyedArchive.h"

#include <gtest/gtest.h>

#include <limits>

#include "platform/archive/PropertyList.h"

namespace vantrell {
namespace {

using Dictionary = ArchiveValue::Dictionary;
using List = ArchiveValue::List;
using Record = ArchiveValue::Record;

constexpr std::initializer_list<ArchiveClass> kAll = {
    ArchiveClass::Null, ArchiveClass::Number, ArchiveClass::String,     ArchiveClass::Date,
    ArchiveClass::Data, ArchiveClass::List,   ArchiveClass::Dictionary, ArchiveClass::Record};

ArchiveValue text(std::string value) { return ArchiveValue(std::move(value)); }
ArchiveValue number(std::uint64_t value) { return ArchiveValue(FndNumber(value)); }
ArchiveValue date(const char* moment) { return ArchiveValue(*FndDate::fromRFC3339(moment)); }

FndData archived(const ArchiveValue& value) {
  auto bytes = archivedDataWithRootObject(value);
  EXPECT_TRUE(bytes) << bytes.error().description();
  return bytes ? *bytes : FndData();
}

void expectRoundTrip(const ArchiveValue& value) {
  const auto back = unarchivedObjectOfClasses(archived(value), kAll);
  ASSERT_TRUE(back) << back.error().description();
  EXPECT_TRUE(*back == value);
}

ArchiveValue nestedLists(std::size_t levels) {
  ArchiveValue value(List{});
  for (std::size_t i = 1; i < levels; ++i) value = ArchiveValue(List{value});
  return value;
}

TEST(KeyedArchive, EveryClassComesBack) {
  expectRoundTrip(ArchiveValue());
  expectRoundTrip(number(UINT64_MAX));
  expectRoundTrip(ArchiveValue(FndNumber(-7L)));
  expectRoundTrip(ArchiveValue(FndNumber(2.5)));
  expectRoundTrip(ArchiveValue(FndNumber(false)));
  expectRoundTrip(text("grün"));
  expectRoundTrip(date("2026-11-21T18:53:15.25Z"));
  expectRoundTrip(ArchiveValue(FndData{0, 1, 2}));
  expectRoundTrip(ArchiveValue(List{text("a"), ArchiveValue(), number(1), text("a")}));
  expectRoundTrip(ArchiveValue(Dictionary{{"a", number(1)}, {"", ArchiveValue(List{})}}));
  expectRoundTrip(ArchiveValue(Record{"FndApp", {{"name", text("a")}, {"none", ArchiveValue()}}}));
}

TEST(KeyedArchive, TheEnvelopeIsThis) {
  const auto archive = valueFromBinaryPropertyList(archived(text("a")));
  using Value = PropertyListValue;
  const Value expected(Value::Dictionary{
      {"$version", Value(FndNumber(100000UL))},
      {"$archiver", Value(std::string("FndKeyedArchiver"))},
      {"$top", Value(Value::Dictionary{{"root", Value(PropertyListUID{1})}})},
      {"$objects", Value(Value::Array{Value(std::string("$null")), Value(std::string("a"))})}});
  EXPECT_TRUE(*archive == expected);
}

TEST(KeyedArchive, AnInstanceStandsWithItsClass) {
  const auto archive = valueFromBinaryPropertyList(archived(date("2001-01-01T00:00:01.5Z")));
  const auto& objects = *archive->dictionary()->at("$objects").array();
  using Value = PropertyListValue;
  ASSERT_EQ(objects.size(), 3U);
  EXPECT_TRUE(objects[1] == Value(Value::Dictionary{{"$class", Value(PropertyListUID{2})},
                                                    {"Fnd.time", Value(FndNumber(1.5))}}));
  EXPECT_TRUE(
      objects[2] ==
      Value(Value::Dictionary{{"$classname", Value(std::string("FndDate"))},
                              {"$classes", Value(Value::Array{Value(std::string("FndDate")),
                                                              Value(std::string("FndObject"))})}}));
}

TEST(KeyedArchive, TheSameValueGivesTheSameBytesHoweverItIsShared) {
  const ArchiveValue inner(List{text("x"), date("2026-01-01T00:00:00Z")});
  const ArchiveValue shared(List{inner, inner});
  const ArchiveValue apart(List{ArchiveValue(List{text("x"), date("2026-01-01T00:00:00Z")}),
                                ArchiveValue(List{text("x"), date("2026-01-01T00:00:00Z")})});
  EXPECT_EQ(archived(shared), archived(apart));
  EXPECT_EQ(archived(shared), archived(*unarchivedObjectOfClasses(archived(shared), kAll)));
}

TEST(KeyedArchive, AStringThatSpellsANumberOrNullStaysAString) {
  expectRoundTrip(ArchiveValue(List{text("1"), number(1), ArchiveValue(FndNumber(1.0)),
                                    ArchiveValue(FndNumber(true)), text("true"), text("$null"),
                                    ArchiveValue(), ArchiveValue(FndData{'1'}), text("")}));
}

TEST(KeyedArchive, WhatWeWriteCanAlwaysBeReadHoweverMuchOfItIsEqual) {
  const List equalLists(300, ArchiveValue(List(300, text("the same"))));
  expectRoundTrip(ArchiveValue(equalLists));
  expectRoundTrip(ArchiveValue(List(2000, text(std::string(64, 'm')))));
  expectRoundTrip(ArchiveValue(List(300, text(std::string(3000, 'l')))));
  expectRoundTrip(
      ArchiveValue(List(300, ArchiveValue(Dictionary{{std::string(3000, 'k'), number(1)}}))));
  expectRoundTrip(ArchiveValue(List(
      300, ArchiveValue(Record{std::string(500, 'c'), {{std::string(500, 'f'), number(1)}}}))));
}

TEST(KeyedArchive, FieldsOfARecordMayBeginWithADollarSign) {
  expectRoundTrip(ArchiveValue(
      Record{"FndApp", {{"$class", text("a")}, {"$$class", text("b")}, {"class", text("c")}}}));
}

TEST(KeyedArchive, ARecordWithTheNameOfAnotherClassIsRefusedByTheWriter) {
  for (const ArchiveClass taken : kAll) {
    const auto bytes =
        archivedDataWithRootObject(ArchiveValue(Record{std::string(archiveClassName(taken)), {}}));
    ASSERT_FALSE(bytes);
    EXPECT_EQ(bytes.error().message(), "This cannot be archived: a record has the class name " +
                                           std::string(archiveClassName(taken)) + ".");
  }
}

TEST(KeyedArchive, WhatAPropertyListCannotHoldIsRefusedByTheWriter) {
  EXPECT_FALSE(archivedDataWithRootObject(text("\xff")));
  EXPECT_FALSE(archivedDataWithRootObject(
      ArchiveValue(FndDate::fromUnixTime(std::numeric_limits<std::int64_t>::max()))));
  EXPECT_TRUE(archivedDataWithRootObject(nestedLists(512)));
  EXPECT_FALSE(archivedDataWithRootObject(nestedLists(513)));
  ArchiveValue doubling{List{}};
  for (int i = 0; i < 60; ++i) doubling = ArchiveValue(List{doubling, doubling});
  EXPECT_FALSE(archivedDataWithRootObject(doubling));
}

TEST(KeyedArchive, NestingUpTo512LevelsComesBack) { expectRoundTrip(nestedLists(512)); }

TEST(KeyedArchive, AnObjectOfAnotherClassIsRefusedWithBothNames) {
  const auto value = unarchivedObjectOfClasses(archived(text("a")), {ArchiveClass::Date});
  ASSERT_FALSE(value);
  EXPECT_TRUE(value.error().is(kVantrellErrorDomain,
                               static_cast<std::int64_t>(VantrellErrorCode::DamagedData)));
  EXPECT_EQ(*value.error().info<std::string>("expected"), "FndDate");
  EXPECT_EQ(*value.error().info<std::string>("actual"), "FndString");
  EXPECT_EQ(value.error().message(),
            "The archive holds an object of class FndString, not of "
            "FndDate.");
}

TEST(KeyedArchive, EachObjectInsideMustBeOfAnAllowedClassToo) {
  const FndData bytes = archived(ArchiveValue(List{text("a"), number(1)}));
  const auto value = unarchivedObjectOfClasses(bytes, {ArchiveClass::List, ArchiveClass::String});
  ASSERT_FALSE(value);
  EXPECT_EQ(*value.error().info<std::string>("expected"), "FndArray, FndString");
  EXPECT_EQ(*value.error().info<std::string>("actual"), "FndNumber");
}

TEST(KeyedArchive, EachClassIsRefusedWhenOnlyAnotherIsAllowed) {
  const List all = {ArchiveValue(),
                    number(1),
                    text("a"),
                    date("2026-01-01T00:00:00Z"),
                    ArchiveValue(FndData{1}),
                    ArchiveValue(List{}),
                    ArchiveValue(Dictionary{}),
                    ArchiveValue(Record{"FndApp", {}})};
  for (const ArchiveValue& value : all) {
    const FndData bytes = archived(value);
    for (const ArchiveClass allowed : kAll) {
      const auto read = unarchivedObjectOfClasses(bytes, {allowed});
      EXPECT_EQ(read.has_value(), allowed == value.archiveClass()) << value.description();
      if (read) continue;
      EXPECT_EQ(*read.error().info<std::string>("actual"), value.className());
    }
  }
}

TEST(KeyedArchive, KeysOfADictionaryNeedNoPermissionOfTheirOwn) {
  const FndData bytes = archived(ArchiveValue(Dictionary{{"a", number(1)}}));
  EXPECT_TRUE(unarchivedObjectOfClasses(bytes, {ArchiveClass::Dictionary, ArchiveClass::Number}));
}

TEST(KeyedArchive, DescriptionsSayTheTextOrTheCount) {
  EXPECT_EQ(ArchiveValue().description(), "null");
  EXPECT_EQ(text("a").description(), "a");
  EXPECT_EQ(number(7).description(), "7");
  EXPECT_EQ(date("2026-01-01T00:00:00Z").description(), "2026-01-01T00:00:00Z");
  EXPECT_EQ(ArchiveValue(FndData(12, 0)).description(), "FndData of 12");
  EXPECT_EQ(ArchiveValue(List{number(1)}).description(), "FndArray of 1");
  EXPECT_EQ(ArchiveValue(Dictionary{}).description(), "FndDictionary of 0");
  EXPECT_EQ(ArchiveValue(Record{"FndApp", {{"a", number(1)}}}).description(), "FndApp of 1");
}

TEST(KeyedArchive, AnArchiveOfOneDateFitsManyTimesIntoAnAttribute) {
  EXPECT_LT(archived(date("2026-11-21T18:53:15.25Z")).size(), 256U);
}

}  // namespace
}  // namespace vantrell
