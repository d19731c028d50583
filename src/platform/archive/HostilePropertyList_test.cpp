#include <gtest/gtest.h>

#include <ctime>
#include <limits>

#include "platform/archive/PropertyList.h"
#include "tests/support/MemoryMeter.h"
#include "tests/support/RawPropertyList.h"

namespace vantrell {
namespace {

using References = RawPropertyList::References;

constexpr std::uint64_t kHugeCounts[] = {(1UL << 31) - 1, 1UL << 31,  (1UL << 32) - 1,   1UL << 32,
                                         (1UL << 60) - 1, 1UL << 60,  (1UL << 63) - 1,   1UL << 63,
                                         UINT64_MAX - 1,  UINT64_MAX, UINT64_MAX / 2 + 2};

// Even a sanitizer's build needs far less for any of these files; what is not bounded needs far
// more than can be waited for.
constexpr std::clock_t kPatience = 60 * CLOCKS_PER_SEC;  // of the processor, not of the wall
constexpr std::size_t kBytesOfMemoryPerByte = 150;
constexpr std::size_t kMemoryToBeginWith = 64 * 1024;

// Decodes, and holds the decoder to its promise on work and memory.
Result<PropertyListValue> decoded(const FndData& bytes) {
  const std::clock_t start = std::clock();
  const MemoryMeter meter;
  auto value = valueFromBinaryPropertyList(bytes);
  EXPECT_LE(meter.peakBytes(), kMemoryToBeginWith + kBytesOfMemoryPerByte * bytes.size());
  EXPECT_LT(std::clock() - start, kPatience);
  return value;
}

std::string errorOf(const FndData& bytes) {
  const auto value = decoded(bytes);
  if (value) return "no error";
  EXPECT_TRUE(value.error().is(kVantrellErrorDomain,
                               static_cast<std::int64_t>(VantrellErrorCode::DamagedData)));
  return value.error().message();
}

std::string damage(std::string_view what, std::size_t offset) {
  return "The property list is damaged: " + std::string(what) + " (byte " + std::to_string(offset) +
         ").";
}

// The error of a list whose only object is `object`, which stands at byte 8.
std::string errorOfObject(FndData object) {
  RawPropertyList list;
  list.add(std::move(object));
  return errorOf(list.bytes());
}

FndData withCount(std::uint8_t type, std::uint64_t count) {
  FndData object = {static_cast<std::uint8_t>(type | 0x0f), 0x13};
  const FndData bytes = bigEndianBytes(count, 8);
  object.insert(object.end(), bytes.begin(), bytes.end());
  return object;
}

FndData goodList() {
  const auto bytes = binaryPropertyListFromValue(PropertyListValue(PropertyListValue::Dictionary{
      {"array", PropertyListValue(PropertyListValue::Array{
                    PropertyListValue(FndNumber(1UL)), PropertyListValue(std::string("grün")),
                    PropertyListValue(FndDate::fromUnixTime(0))})},
      {"data", PropertyListValue(FndData(20, 7))},
      {"real", PropertyListValue(FndNumber(2.5))},
      {"string", PropertyListValue(std::string(300, 's'))},
      {"uid", PropertyListValue(PropertyListUID{5})}}));
  EXPECT_TRUE(bytes);
  return *bytes;
}

TEST(HostilePropertyList, AnArrayThatHoldsItselfIsRefused) {
  RawPropertyList list;
  list.addArray({0});
  EXPECT_EQ(errorOf(list.bytes()), damage("a container holds itself", 10));
}

TEST(HostilePropertyList, ADictionaryThatHoldsItselfAsAValueIsRefused) {
  RawPropertyList list;
  list.addDictionary({1}, {0});
  list.addString("key");
  EXPECT_EQ(errorOf(list.bytes()), damage("a container holds itself", 15));
}

TEST(HostilePropertyList, ADictionaryThatIsItsOwnKeyIsRefused) {
  RawPropertyList list;
  list.addDictionary({0}, {1});
  list.addString("value");
  EXPECT_EQ(errorOf(list.bytes()), damage("a container holds itself", 17));
}

TEST(HostilePropertyList, ARingOfAThousandContainersIsRefused) {
  RawPropertyList list(2);
  for (std::uint64_t i = 0; i < 500; ++i) list.addArray({(i + 1) % 500});
  EXPECT_NE(errorOf(list.bytes()).find("a container holds itself"), std::string::npos);
  RawPropertyList longRing(2);
  for (std::uint64_t i = 0; i < 1000; ++i) longRing.addArray({(i + 1) % 1000});
  EXPECT_NE(errorOf(longRing.bytes()).find("it is nested too deep"), std::string::npos);
}

TEST(HostilePropertyList, ADepthOf200000IsRefused) {
  constexpr std::uint64_t kDepth = 200000;
  RawPropertyList arrays(3);
  for (std::uint64_t i = 0; i < kDepth; ++i) arrays.addArray({i + 1});
  arrays.addArray({});
  EXPECT_NE(errorOf(arrays.bytes()).find("it is nested too deep"), std::string::npos);
  RawPropertyList dictionaries(3);
  for (std::uint64_t i = 0; i < kDepth; ++i) dictionaries.addDictionary({kDepth + 1}, {i + 1});
  dictionaries.addArray({});
  dictionaries.addString("key");
  EXPECT_NE(errorOf(dictionaries.bytes()).find("it is nested too deep"), std::string::npos);
}

TEST(HostilePropertyList, ADepthOf200000ThatIsReadFromBelowIsRefused) {
  constexpr std::uint64_t kDepth = 200000;
  RawPropertyList list(3);
  References all;
  list.addArray({});
  for (std::uint64_t i = 1; i < kDepth; ++i) {
    list.addArray({i - 1});
    all.push_back(i);
  }
  list.setTop(list.addArray(all));  // each level is known when the next one asks for it
  EXPECT_NE(errorOf(list.bytes()).find("it is nested too deep"), std::string::npos);
}

TEST(HostilePropertyList, SixtyLevelsThatDoubleCostSixtyObjects) {
  RawPropertyList list;
  for (std::uint64_t i = 0; i < 60; ++i) list.addArray({i + 1, i + 1});
  list.addArray({});
  const auto value = decoded(list.bytes());
  ASSERT_TRUE(value) << value.error().description();
  EXPECT_TRUE(*value == *valueFromBinaryPropertyList(list.bytes()));
}

TEST(HostilePropertyList, SixtyLevelsOfDictionariesThatDoubleCostSixtyObjects) {
  RawPropertyList list;
  for (std::uint64_t i = 0; i < 60; ++i) list.addDictionary({61, 62}, {i + 1, i + 1});
  list.addArray({});
  list.addString("a");
  list.addString("b");
  EXPECT_TRUE(decoded(list.bytes()));
}

TEST(HostilePropertyList, CountsNearThePowersOfTwoAreRefusedBeforeAnythingIsAllocated) {
  for (const std::uint64_t count : kHugeCounts) {
    for (const std::uint8_t type : FndData{0x40, 0x50, 0x60, 0xa0, 0xd0}) {
      EXPECT_EQ(errorOfObject(withCount(type, count)), damage("an object runs past the end", 8));
    }
    RawPropertyList objects;
    objects.addArray({});
    objects.claimCount(count);
    EXPECT_EQ(errorOf(objects.bytes()), damage("more objects than the offset table has", 21));
    RawPropertyList table;
    table.addArray({});
    table.claimTableOffset(count);
    EXPECT_EQ(errorOf(table.bytes()), damage("the offset table lies outside", 37));
    RawPropertyList top;
    top.addArray({});
    top.setTop(count);
    EXPECT_EQ(errorOf(top.bytes()), damage("the top object does not exist", 29));
    RawPropertyList reference(8);
    reference.addArray({count});
    EXPECT_EQ(errorOf(reference.bytes()), damage("a reference to no object", 8));
  }
}

TEST(HostilePropertyList, OffsetsNearThePowersOfTwoAreRefused) {
  for (const std::uint64_t offset : kHugeCounts) {
    RawPropertyList list(1, 8);
    list.addArray({});
    FndData bytes = list.bytes();
    const FndData entry = bigEndianBytes(offset, 8);
    std::copy(entry.begin(), entry.end(), bytes.begin() + 9);
    EXPECT_EQ(errorOf(bytes), damage("an object lies outside", 9));
  }
}

TEST(HostilePropertyList, SizesOf0And9And255AreRefusedAnd3IsNotTaken) {
  for (const std::uint8_t size : FndData{0, 9, 255}) {
    RawPropertyList offsets;
    offsets.addArray({});
    offsets.claimSizes(size, 1);
    EXPECT_EQ(errorOf(offsets.bytes()), damage("an impossible offset size", 19));
    RawPropertyList references;
    references.addArray({});
    references.claimSizes(4, size);
    EXPECT_EQ(errorOf(references.bytes()), damage("an impossible reference size", 20));
  }
  RawPropertyList three;  // the truth is 4 and 1
  three.addArray({1});
  three.addArray({});
  three.claimSizes(3, 3);
  EXPECT_NE(errorOf(three.bytes()), "no error");
}

TEST(HostilePropertyList, EveryTruncationIsRefused) {
  const FndData good = goodList();
  ASSERT_TRUE(decoded(good));
  for (std::size_t length = 0; length < good.size(); ++length) {
    EXPECT_NE(errorOf(FndData(good.begin(), good.begin() + static_cast<std::ptrdiff_t>(length))),
              "no error")
        << length;
  }
}

TEST(HostilePropertyList, EveryFlippedByteIsReadOrRefusedWithoutHarm) {
  const FndData good = goodList();
  std::size_t refused = 0;
  for (std::size_t i = 0; i < good.size(); ++i) {
    for (int bit = 0; bit < 8; ++bit) {
      FndData flipped = good;
      flipped[i] = static_cast<std::uint8_t>(flipped[i] ^ 1 << bit);
      refused += decoded(flipped) ? 0 : 1;
    }
  }
  EXPECT_GT(refused, good.size());
}

TEST(HostilePropertyList, AWrongMagicIsRefused) {
  const FndData bytes = goodList();
  for (std::size_t i = 0; i < 8; ++i) {
    FndData wrong = bytes;
    ++wrong[i];
    EXPECT_EQ(errorOf(wrong), damage("it does not begin with \"bplist00\"", 0));
  }
  EXPECT_EQ(errorOf({}), damage("it is too short", 0));
}

TEST(HostilePropertyList, OddSurrogatesAreRefusedWithTheirPlace) {
  EXPECT_EQ(errorOfObject(bytesFromHex("61 d800")), damage("a surrogate without its partner", 9));
  EXPECT_EQ(errorOfObject(bytesFromHex("61 dfff")), damage("a surrogate without its partner", 9));
  EXPECT_EQ(errorOfObject(bytesFromHex("62 0061 dbff")),
            damage("a surrogate without its partner", 11));
  EXPECT_EQ(errorOfObject(bytesFromHex("62 d800 d800")),
            damage("a surrogate without its partner", 9));
  EXPECT_EQ(errorOfObject(bytesFromHex("62 dc00 d800")),
            damage("a surrogate without its partner", 9));
}

TEST(HostilePropertyList, DatesThatAreNoMomentAreRefused) {
  for (const char* bits : {"33 7ff0000000000000", "33 fff0000000000000", "33 7ff8000000000000",
                           "33 7fefffffffffffff", "33 ffefffffffffffff"}) {
    EXPECT_EQ(errorOfObject(bytesFromHex(bits)), damage("a date that is no moment", 8));
  }
}

TEST(HostilePropertyList, ObjectsOfUnknownTypesAndSizesAreRefused) {
  for (const char* unknown : {"00", "01", "0f", "70", "90", "b0", "c0", "e0", "f0"}) {
    EXPECT_EQ(errorOfObject(bytesFromHex(unknown)), damage("an object of an unknown type", 8));
  }
  EXPECT_EQ(errorOfObject(FndData(40, 0x15)), damage("an integer of an impossible size", 8));
  EXPECT_EQ(errorOfObject(FndData(40, 0x21)), damage("a real number of an impossible size", 8));
  EXPECT_EQ(errorOfObject(FndData(40, 0x32)), damage("a date of an impossible size", 8));
  EXPECT_EQ(errorOfObject(bytesFromHex("51 80")),
            damage("an ASCII string with another character", 9));
  EXPECT_EQ(errorOfObject(bytesFromHex("4f 50")), damage("a count that is no integer", 9));
  EXPECT_EQ(errorOfObject(bytesFromHex("4f 14 00")), damage("a count that is no integer", 9));
  EXPECT_EQ(errorOfObject(bytesFromHex("4f")), damage("an object runs past the end", 8));
  EXPECT_EQ(errorOfObject(bytesFromHex("4f 13 00")), damage("an object runs past the end", 8));
}

TEST(HostilePropertyList, EveryScalarThatRunsPastTheEndIsRefused) {
  for (const char* cut :
       {"10", "11 00", "12 000000", "13 00000000000000", "14 00", "22 000000", "23 00000000000000",
        "33 00000000000000", "8f 00", "42 00", "5e 41", "62 0041 00", "a1", "d1 00"}) {
    EXPECT_EQ(errorOfObject(bytesFromHex(cut)), damage("an object runs past the end", 8)) << cut;
  }
}

TEST(HostilePropertyList, KeysMustBeStringsAndStandOnce) {
  RawPropertyList number;
  number.addDictionary({1}, {1});
  number.add({0x10, 1});
  EXPECT_EQ(errorOf(number.bytes()), damage("a key that is no string", 8));
  RawPropertyList twice;
  twice.addDictionary({1, 2}, {1, 1});
  twice.addString("a");
  twice.addString("a");
  EXPECT_EQ(errorOf(twice.bytes()), damage("a key that stands twice", 8));
}

TEST(HostilePropertyList, ManyNumbersForOneLargeObjectAreRefused) {
  RawPropertyList list(2);
  const std::uint64_t large = list.addArray(References(5000, 1));
  list.addString("x");
  References all;
  for (int i = 0; i < 5000; ++i) all.push_back(list.addAgain(large));
  list.setTop(list.addArray(all));  // 25,000,000 elements from 50,000 bytes
  EXPECT_NE(errorOf(list.bytes()).find("objects overlap"), std::string::npos);
}

TEST(HostilePropertyList, ObjectsThatBeginInsideEachOtherAreRefused) {
  // Each begins data of 16,384 bytes, four bytes behind the one before.
  RawPropertyList list(2);
  References all;
  for (int i = 0; i < 5000; ++i) {
    const FndData header = bytesFromHex("4f 11 4000");
    all.push_back(list.add(header));
  }
  list.add(FndData(0x4000, 0));
  list.setTop(list.addArray(all));
  EXPECT_NE(errorOf(list.bytes()).find("objects overlap"), std::string::npos);
}

TEST(HostilePropertyList, AHugeStringInAMillionPlacesIsOneString) {
  RawPropertyList list;
  const std::uint64_t huge = list.addString(std::string(1 << 20, 'h'));
  list.setTop(list.addArray(References(1 << 20, huge)));
  const auto value = decoded(list.bytes());
  ASSERT_TRUE(value) << value.error().description();
  EXPECT_EQ(value->array()->front().string(), value->array()->back().string());
}

TEST(HostilePropertyList, AHugeKeyInManyDictionariesIsRefused) {
  RawPropertyList list(2);
  const std::uint64_t key = list.addString(std::string(1 << 20, 'k'));
  References all;
  for (int i = 0; i < 10000; ++i) all.push_back(list.addDictionary({key}, {key}));
  list.setTop(list.addArray(all));  // ten gigabytes of keys, if each dictionary had its own
  EXPECT_NE(errorOf(list.bytes()).find("long keys stand in too many places"), std::string::npos);
}

TEST(HostilePropertyList, AMillionObjectsThatNothingLeadsToCostLittle) {
  RawPropertyList list(4);
  for (int i = 0; i < 1000000; ++i) list.add({0x09});
  list.setTop(list.addArray({}));
  EXPECT_TRUE(decoded(list.bytes()));
}

}  // namespace
}  // namespace vantrell
