#include "platform/archive/PropertyList.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>

#include "tests/support/RawPropertyList.h"

namespace vantrell {
namespace {

using Array = PropertyListValue::Array;
using Dictionary = PropertyListValue::Dictionary;
using Value = PropertyListValue;

Value text(std::string value) { return Value(std::move(value)); }
Value number(std::uint64_t value) { return Value(FndNumber(value)); }

FndData encoded(const Value& value) {
  auto bytes = binaryPropertyListFromValue(value);
  EXPECT_TRUE(bytes) << bytes.error().description();
  return bytes ? *bytes : FndData();
}

std::string errorOf(const Result<Value>& result) {
  return result ? "no error" : result.error().message();
}

void expectRoundTrip(const Value& value) {
  const auto back = valueFromBinaryPropertyList(encoded(value));
  ASSERT_TRUE(back) << back.error().description();
  EXPECT_TRUE(*back == value);
}

// A property list whose only object is `object`.
Result<Value> decodedObject(FndData object) {
  RawPropertyList list;
  list.add(std::move(object));
  return valueFromBinaryPropertyList(list.bytes());
}

Value nestedArrays(std::size_t levels) {
  Value value(Array{});
  for (std::size_t i = 1; i < levels; ++i) value = Value(Array{value});
  return value;
}

Value doublingArrays(std::size_t levels) {
  Value value(Array{});
  for (std::size_t i = 0; i < levels; ++i) value = Value(Array{value, value});
  return value;
}

TEST(PropertyList, IntegersOfEverySizeComeBack) {
  for (const std::uint64_t value :
       {0UL, 1UL, 127UL, 128UL, 255UL, 256UL, 65535UL, 65536UL, 4294967295UL, 4294967296UL,
        9223372036854775807UL, 9223372036854775808UL, 18446744073709551615UL}) {
    expectRoundTrip(number(value));
  }
  for (const std::int64_t value :
       {-1L, -128L, -129L, -4294967296L, std::numeric_limits<std::int64_t>::min()}) {
    expectRoundTrip(Value(FndNumber(value)));
  }
}

TEST(PropertyList, TruthValuesAndRealNumbersComeBackAsWhatTheyWere) {
  expectRoundTrip(Value(FndNumber(true)));
  expectRoundTrip(Value(FndNumber(false)));
  for (const double value : {0.0, 1.0, -1.5, 1e300, std::numeric_limits<double>::denorm_min(),
                             std::numeric_limits<double>::infinity()}) {
    expectRoundTrip(Value(FndNumber(value)));
  }
  EXPECT_FALSE(*valueFromBinaryPropertyList(encoded(Value(FndNumber(true)))) == number(1));
}

TEST(PropertyList, StringsOfEveryLengthAndPlaneComeBack) {
  for (const std::size_t length : {0U, 1U, 14U, 15U, 16U, 255U, 256U, 65535U, 65536U}) {
    expectRoundTrip(text(std::string(length, 'x')));
    std::string wide;
    for (std::size_t i = 0; i < length; ++i) wide += "ü";
    expectRoundTrip(text(wide));
  }
  expectRoundTrip(text(std::string("a\0b", 3)));
  expectRoundTrip(text("\u00df \u0800 \uffff \U00010000 \U0010ffff"));
}

TEST(PropertyList, DatesComeBackToTheFractionThatADoubleHolds) {
  for (const char* moment :
       {"2001-01-01T00:00:00Z", "2000-12-31T23:59:59.5Z", "2026-11-21T18:53:15.25Z",
        "1904-02-29T12:00:00Z", "9999-12-31T23:59:59Z", "0001-01-01T00:00:00Z"}) {
    expectRoundTrip(Value(*FndDate::fromRFC3339(moment)));
  }
}

TEST(PropertyList, DataUIDsAndContainersComeBack) {
  expectRoundTrip(Value(FndData{}));
  expectRoundTrip(Value(FndData(70000, 0xa5)));
  for (const std::uint32_t uid : {0U, 255U, 256U, 65536U, 4294967295U}) {
    expectRoundTrip(Value(PropertyListUID{uid}));
  }
  expectRoundTrip(Value(Array{}));
  expectRoundTrip(Value(Dictionary{}));
  Dictionary many;
  for (int i = 0; i < 1000; ++i) {
    many.emplace("key " + std::to_string(i), Value(Array{number(static_cast<unsigned>(i))}));
  }
  expectRoundTrip(Value(many));
}

TEST(PropertyList, TheBytesOfADictionaryAreThese) {
  Dictionary dictionary;
  dictionary.emplace("b", Value(Array{number(1), text("b"), Value(FndNumber(true))}));
  dictionary.emplace("a", text("ü"));
  EXPECT_EQ(encoded(Value(dictionary)),
            bytesFromHex("62706c6973743030"      // bplist00
                         "d2 0102 0304"          // 0: {1: 3, 2: 4}
                         "5161 5162"             // 1: "a"  2: "b"
                         "61 00fc"               // 3: "ü"
                         "a3 050206"             // 4: [5, 2, 6]
                         "1001 09"               // 5: 1  6: true
                         "08 0d 0f 11 14 18 1a"  // where they begin
                         "000000000000 01 01"    // sizes
                         "0000000000000007 0000000000000000 000000000000001b"));
}

TEST(PropertyList, TheSameValueGivesTheSameBytesHoweverItIsShared) {
  const Value inner(Array{text("x"), number(7)});
  const Value shared(Array{inner, inner});
  const Value apart(Array{Value(Array{text("x"), number(7)}), Value(Array{text("x"), number(7)})});
  EXPECT_EQ(encoded(shared), encoded(apart));
  EXPECT_EQ(encoded(shared), encoded(*valueFromBinaryPropertyList(encoded(shared))));
}

TEST(PropertyList, EqualShortScalarsAreWrittenOnce) {
  const std::size_t one = encoded(Value(Array{text("a label of some length")})).size();
  const std::size_t ten = encoded(Value(Array(10, text("a label of some length")))).size();
  EXPECT_EQ(ten, one + 9);
}

TEST(PropertyList, MoreThan256ObjectsTakeWiderReferencesAndOffsets) {
  Array array;
  for (std::uint64_t i = 0; i < 70000; ++i) array.push_back(number(i));
  expectRoundTrip(Value(array));
}

TEST(PropertyList, AStringThatIsNotUTF8IsRefusedByTheWriter) {
  for (const char* bad : {"\xff", "a\xc3", "\xed\xa0\x80", "\xc0\x80", "\xf5\x80\x80\x80"}) {
    const auto bytes = binaryPropertyListFromValue(text(bad));
    ASSERT_FALSE(bytes);
    EXPECT_EQ(bytes.error().message(), "This cannot be a property list: a string is not UTF-8.");
    EXPECT_FALSE(binaryPropertyListFromValue(Value(Dictionary{{bad, number(1)}})));
  }
}

TEST(PropertyList, ADateBeyondAMillionYearsIsRefusedByTheWriter) {
  for (const std::int64_t seconds :
       {std::numeric_limits<std::int64_t>::max(), std::numeric_limits<std::int64_t>::min()}) {
    const auto bytes = binaryPropertyListFromValue(Value(FndDate::fromUnixTime(seconds)));
    ASSERT_FALSE(bytes);
    EXPECT_EQ(bytes.error().message(), "This cannot be a property list: a date is too far away.");
  }
}

TEST(PropertyList, NestingUpTo512LevelsComesBackAndOneMoreIsRefused) {
  expectRoundTrip(nestedArrays(512));
  EXPECT_FALSE(binaryPropertyListFromValue(nestedArrays(513)));
}

TEST(PropertyList, ASharedContainerCountsItsDepthWhereItStandsDeepest) {
  const Value half = nestedArrays(256);
  Value deep = half;  // read first near the top, it stands again below 256 others
  for (int i = 0; i < 256; ++i) deep = Value(Array{deep});
  EXPECT_TRUE(binaryPropertyListFromValue(deep));
  EXPECT_FALSE(binaryPropertyListFromValue(Value(Array{half, deep})));
}

TEST(PropertyList, SixtyLevelsThatDoubleAreComparedAndRefusedByTheWriterAtOnce) {
  const Value one = doublingArrays(60);
  const Value other = doublingArrays(60);
  EXPECT_TRUE(one == other);
  EXPECT_FALSE(one == doublingArrays(61));
  EXPECT_FALSE(binaryPropertyListFromValue(one));
}

TEST(PropertyList, ValuesOfDifferentTypesAreNeverEqual) {
  const Array all = {number(1),      Value(FndNumber(1.0)), Value(FndNumber(true)),
                     text("1"),      Value(FndData{1}),     Value(PropertyListUID{1}),
                     Value(Array{}), Value(Dictionary{}),   Value(FndDate::fromUnixTime(1)),
                     text(""),       Value(FndData{})};
  for (std::size_t i = 0; i < all.size(); ++i) {
    for (std::size_t k = 0; k < all.size(); ++k) EXPECT_EQ(all[i] == all[k], i == k) << i << k;
  }
}

// What other writers make.

TEST(StrangersPropertyList, IntegersOf64And128BitsAreRead) {
  EXPECT_TRUE(*decodedObject(bytesFromHex("13 0000000000000007")) == number(7));
  EXPECT_TRUE(*decodedObject(bytesFromHex("13 ffffffffffffffff")) == Value(FndNumber(-1L)));
  EXPECT_TRUE(*decodedObject(bytesFromHex("14 0000000000000000 ffffffffffffffff")) ==
              number(UINT64_MAX));
  EXPECT_TRUE(*decodedObject(bytesFromHex("14 ffffffffffffffff 8000000000000000")) ==
              Value(FndNumber(INT64_MIN)));
  EXPECT_EQ(errorOf(decodedObject(bytesFromHex("14 0000000000000001 0000000000000000"))),
            "The property list is damaged: an integer beyond 64 bits (byte 8).");
  EXPECT_EQ(errorOf(decodedObject(bytesFromHex("14 ffffffffffffffff 7fffffffffffffff"))),
            "The property list is damaged: an integer beyond 64 bits (byte 8).");
}

TEST(StrangersPropertyList, SmallIntegersInWideFormsAndAsciiInUTF16AreRead) {
  EXPECT_TRUE(*decodedObject(bytesFromHex("12 00000001")) == number(1));
  EXPECT_TRUE(*decodedObject(bytesFromHex("11 ffff")) == number(65535));
  EXPECT_TRUE(*decodedObject(bytesFromHex("62 0061 0062")) == text("ab"));
  EXPECT_TRUE(*decodedObject(bytesFromHex("62 d83d de00")) == text("\U0001f600"));
  EXPECT_TRUE(*decodedObject(bytesFromHex("22 3fc00000")) == Value(FndNumber(1.5)));
  EXPECT_TRUE(*decodedObject(bytesFromHex("5f 10 02 6162")) == text("ab"));
}

TEST(StrangersPropertyList, UIDsAreReadInAnyWidthThatHoldsThem) {
  EXPECT_TRUE(*decodedObject(bytesFromHex("82 000001")) == Value(PropertyListUID{1}));
  EXPECT_TRUE(*decodedObject(bytesFromHex("87 00000000 ffffffff")) ==
              Value(PropertyListUID{UINT32_MAX}));
  EXPECT_EQ(errorOf(decodedObject(bytesFromHex("87 00000001 00000000"))),
            "The property list is damaged: a UID beyond 32 bits (byte 8).");
}

TEST(StrangersPropertyList, OffsetsAndReferencesOfOneToEightBytesAreRead) {
  const Value expected(Array{text("a"), text("b"), text("a")});
  for (std::size_t offsetSize = 1; offsetSize <= 8; ++offsetSize) {
    for (std::size_t referenceSize = 1; referenceSize <= 8; ++referenceSize) {
      RawPropertyList list(referenceSize, offsetSize);
      list.addString("a");
      list.addString("b");
      list.setTop(list.addArray({0, 1, 0}));
      const auto value = valueFromBinaryPropertyList(list.bytes());
      ASSERT_TRUE(value) << value.error().description();
      EXPECT_TRUE(*value == expected);
    }
  }
}

TEST(StrangersPropertyList, SharedContainersAreReadAndNotCopied) {
  RawPropertyList list;
  list.addString("x");
  list.addArray({0});
  list.setTop(list.addArray({1, 1}));
  const auto value = valueFromBinaryPropertyList(list.bytes());
  ASSERT_TRUE(value);
  const Array& top = *value->array();
  EXPECT_TRUE(top[0] == Value(Array{text("x")}));
  EXPECT_EQ(top[0].array(), top[1].array());
  EXPECT_EQ((*top[0].array())[0].string(), (*top[1].array())[0].string());
}

TEST(StrangersPropertyList, DictionaryKeysMayComeInAnyOrder) {
  RawPropertyList list;
  list.addString("b");
  list.addString("a");
  list.setTop(list.addDictionary({0, 1}, {1, 0}));
  const auto value = valueFromBinaryPropertyList(list.bytes());
  ASSERT_TRUE(value);
  EXPECT_TRUE(*value == Value(Dictionary{{"a", text("b")}, {"b", text("a")}}));
}

}  // namespace
}  // namespace vantrell
