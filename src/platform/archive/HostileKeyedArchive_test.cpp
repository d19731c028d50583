#include <gtest/gtest.h>

#include <chrono>
#include <limits>

#include "platform/archive/KeyedArchive.h"
#include "platform/archive/PropertyList.h"
#include "tests/support/MemoryMeter.h"
#include "tests/support/RawPropertyList.h"

namespace vantrell {
namespace {

using Value = PropertyListValue;
using Objects = PropertyListValue::Array;
using Fields = PropertyListValue::Dictionary;

// The places of these classes in every archive made here; what is hostile begins behind them.
constexpr std::uint32_t kListClass = 1;
constexpr std::uint32_t kDictionaryClass = 2;
constexpr std::uint32_t kDateClass = 3;
constexpr std::uint32_t kRecordClass = 4;
constexpr std::uint32_t kRoot = 5;

constexpr std::chrono::seconds kPatience{20};
constexpr std::size_t kBytesOfMemoryPerByte = 200;
constexpr std::size_t kMemoryToBeginWith = 64 * 1024;

Value text(std::string value) { return Value(std::move(value)); }
Value uid(std::uint32_t index) { return Value(PropertyListUID{index}); }

Value classNamed(const char* name) {
  return Value(Fields{{"$classname", text(name)},
                      {"$classes", Value(Objects{text(name), text("FndObject")})}});
}

Value instance(std::uint32_t classIndex, Fields fields) {
  fields.emplace("$class", uid(classIndex));
  return Value(std::move(fields));
}

Value list(Objects elements) {
  return instance(kListClass, {{"Fnd.objects", Value(std::move(elements))}});
}

Value dictionary(Objects keys, Objects elements) {
  return instance(kDictionaryClass, {{"Fnd.keys", Value(std::move(keys))},
                                     {"Fnd.objects", Value(std::move(elements))}});
}

Objects objectsBegun() {
  return {text("$null"), classNamed("FndArray"), classNamed("FndDictionary"), classNamed("FndDate"),
          classNamed("FndApp")};
}

Fields envelope(Objects objects) {
  return {{"$version", Value(FndNumber(100000UL))},
          {"$archiver", text("FndKeyedArchiver")},
          {"$top", Value(Fields{{"root", uid(kRoot)}})},
          {"$objects", Value(std::move(objects))}};
}

FndData bytesOf(Fields archive) {
  const auto bytes = binaryPropertyListFromValue(Value(std::move(archive)));
  EXPECT_TRUE(bytes);
  return bytes ? *bytes : FndData();
}

// An archive with these objects at 5, 6, …; the first is the root.
FndData archiveOf(Objects objects) {
  Objects all = objectsBegun();
  all.insert(all.end(), objects.begin(), objects.end());
  return bytesOf(envelope(std::move(all)));
}

Result<ArchiveValue> decoded(const FndData& bytes) {
  const auto start = std::chrono::steady_clock::now();
  const MemoryMeter meter;
  auto value = unarchivedObjectOfClasses(
      bytes,
      {ArchiveClass::Null, ArchiveClass::Number, ArchiveClass::String, ArchiveClass::Date,
       ArchiveClass::Data, ArchiveClass::List, ArchiveClass::Dictionary, ArchiveClass::Record});
  EXPECT_LE(meter.peakBytes(), kMemoryToBeginWith + kBytesOfMemoryPerByte * bytes.size());
  EXPECT_LT(std::chrono::steady_clock::now() - start, kPatience);
  return value;
}

std::string errorOf(const FndData& bytes) {
  const auto value = decoded(bytes);
  if (value) return "no error";
  EXPECT_TRUE(value.error().is(kVantrellErrorDomain,
                               static_cast<std::int64_t>(VantrellErrorCode::DamagedData)));
  return value.error().message();
}

std::string damage(std::string_view what) {
  return "The archive is damaged: " + std::string(what) + ".";
}

const char* const kUnfolds = "what it shares would unfold to far more than its size";

TEST(HostileKeyedArchive, AListThatHoldsItselfIsRefused) {
  EXPECT_EQ(errorOf(archiveOf({list({uid(kRoot)})})), damage("an object holds itself (object 5)"));
}

TEST(HostileKeyedArchive, ADictionaryThatHoldsItselfIsRefused) {
  EXPECT_EQ(errorOf(archiveOf({dictionary({uid(6)}, {uid(kRoot)}), text("key")})),
            damage("an object holds itself (object 5)"));
}

TEST(HostileKeyedArchive, ARecordThatHoldsItselfIsRefused) {
  EXPECT_EQ(errorOf(archiveOf({instance(kRecordClass, {{"self", uid(kRoot)}})})),
            damage("an object holds itself (object 5)"));
}

TEST(HostileKeyedArchive, ARingThroughThreeClassesIsRefused) {
  EXPECT_EQ(errorOf(archiveOf({list({uid(6)}), instance(kRecordClass, {{"next", uid(7)}}),
                               dictionary({uid(8)}, {uid(kRoot)}), text("key")})),
            damage("an object holds itself (object 5)"));
}

TEST(HostileKeyedArchive, AClassThatIsItsOwnInstanceIsRefused) {
  EXPECT_EQ(errorOf(archiveOf({instance(kRoot, {})})), damage("a class without a name (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({instance(kRoot, {{"$classname", text("FndArray")},
                                                {"$classes", Value(Objects{})},
                                                {"Fnd.objects", Value(Objects{uid(kRoot)})}})})),
            damage("an object holds itself (object 5)"));
}

TEST(HostileKeyedArchive, ADepthOf200000IsRefused) {
  constexpr std::uint32_t kDepth = 200000;
  Objects lists;
  for (std::uint32_t i = 0; i < kDepth; ++i) lists.push_back(list({uid(kRoot + i + 1)}));
  lists.push_back(list({}));
  EXPECT_NE(errorOf(archiveOf(lists)).find("it is nested too deep"), std::string::npos);
}

TEST(HostileKeyedArchive, ADepthOf200000ThatIsReadFromBelowIsRefused) {
  constexpr std::uint32_t kDepth = 200000;
  Objects lists = {list({})};
  Objects all;
  for (std::uint32_t i = 0; i < kDepth; ++i) {
    lists.push_back(list(i == 0 ? Objects{} : Objects{uid(kRoot + i)}));
    all.push_back(uid(kRoot + i + 1));
  }
  lists.front() = list(all);
  EXPECT_NE(errorOf(archiveOf(lists)).find("it is nested too deep"), std::string::npos);
}

TEST(HostileKeyedArchive, SixtyLevelsThatDoubleAreRefused) {
  Objects lists;
  for (std::uint32_t i = 0; i < 60; ++i) {
    lists.push_back(list({uid(kRoot + i + 1), uid(kRoot + i + 1)}));
  }
  lists.push_back(list({}));
  EXPECT_EQ(errorOf(archiveOf(lists)), damage(kUnfolds));
}

TEST(HostileKeyedArchive, SixtyLevelsOfDictionariesAndRecordsThatDoubleAreRefused) {
  Objects objects;
  for (std::uint32_t i = 0; i < 60; i += 2) {
    const Value next = uid(kRoot + i + 1);
    const Value afterNext = uid(kRoot + i + 2);
    objects.push_back(dictionary({uid(kRoot + 61), uid(kRoot + 62)}, {next, next}));
    objects.push_back(instance(kRecordClass, {{"a", afterNext}, {"b", afterNext}}));
  }
  objects.insert(objects.end(), {list({}), text("a"), text("b")});
  EXPECT_EQ(errorOf(archiveOf(objects)), damage(kUnfolds));
}

TEST(HostileKeyedArchive, AModestAmountOfSharingIsRead) {
  const auto value =
      decoded(archiveOf({list({uid(6), uid(6), uid(6)}), list({uid(7), uid(7)}), text("shared")}));
  ASSERT_TRUE(value) << value.error().description();
  ASSERT_EQ(value->list()->size(), 3U);
  EXPECT_EQ(value->list()->front().list(), value->list()->back().list());
}

// In the two tests below one object of the property list stands at many places of "$objects".
FndData archiveOfOneObjectManyTimes(std::uint64_t (*addObject)(RawPropertyList&), int times) {
  RawPropertyList raw(2);
  const std::uint64_t null = raw.addString("$null");
  const std::uint64_t name = raw.addString("FndArray");
  const std::uint64_t names = raw.addArray({name});
  const std::uint64_t classKey = raw.addString("$class");
  const std::uint64_t elementsKey = raw.addString("Fnd.objects");
  const std::uint64_t listClass =
      raw.addDictionary({raw.addString("$classname"), raw.addString("$classes")}, {name, names});
  const std::uint64_t classUID = raw.add({0x80, 1});
  const std::uint64_t object = addObject(raw);
  RawPropertyList::References objects = {null, listClass};
  RawPropertyList::References uids;
  for (int i = 0; i < times; ++i) {
    uids.push_back(
        raw.add({0x81, static_cast<std::uint8_t>((i + 3) >> 8), static_cast<std::uint8_t>(i + 3)}));
  }
  objects.push_back(raw.addDictionary({classKey, elementsKey}, {classUID, raw.addArray(uids)}));
  objects.insert(objects.end(), static_cast<std::size_t>(times), object);
  const std::uint64_t top = raw.addDictionary({raw.addString("root")}, {raw.add({0x80, 2})});
  raw.setTop(raw.addDictionary({raw.addString("$version"), raw.addString("$archiver"),
                                raw.addString("$top"), raw.addString("$objects")},
                               {raw.add(bytesFromHex("12 000186a0")),
                                raw.addString("FndKeyedArchiver"), top, raw.addArray(objects)}));
  return raw.bytes();
}

TEST(HostileKeyedArchive, AHugeStringThatIsManyObjectsIsRefused) {
  const FndData bytes = archiveOfOneObjectManyTimes(
      [](RawPropertyList& raw) { return raw.addString(std::string(1 << 20, 'h')); }, 5000);
  EXPECT_EQ(errorOf(bytes), damage(kUnfolds));
}

TEST(HostileKeyedArchive, AHugeListThatIsManyObjectsIsRefused) {
  const FndData bytes = archiveOfOneObjectManyTimes(
      [](RawPropertyList& raw) {
        const std::uint64_t null = raw.add({0x80, 0});
        const std::uint64_t elements = raw.addArray(RawPropertyList::References(20000, null));
        return raw.addDictionary({raw.addString("$class"), raw.addString("Fnd.objects")},
                                 {raw.add({0x80, 1}), elements});
      },
      5000);
  EXPECT_EQ(errorOf(bytes), damage(kUnfolds));
}

TEST(HostileKeyedArchive, ReferencesToNoObjectAreRefused) {
  for (const std::uint32_t index : {7U, 255U, 1U << 31, UINT32_MAX}) {
    const std::string missing =
        damage("a reference to no object (object " + std::to_string(index) + ")");
    EXPECT_EQ(errorOf(archiveOf({list({uid(index)}), text("")})), missing);
    EXPECT_EQ(errorOf(archiveOf({instance(kRecordClass, {{"a", uid(index)}}), text("")})), missing);
    EXPECT_EQ(errorOf(archiveOf({instance(index, {}), text("")})),
              damage("an object without a class (object 5)"));
    EXPECT_EQ(errorOf(archiveOf({dictionary({uid(index)}, {uid(6)}), text("")})),
              damage("a key that is no string (object 5)"));
  }
}

TEST(HostileKeyedArchive, AnEnvelopeWithoutItsPartsIsRefused) {
  const Fields good = envelope([] {
    Objects objects = objectsBegun();
    objects.push_back(text("root"));
    return objects;
  }());
  ASSERT_TRUE(decoded(bytesOf(good)));
  const auto errorWith = [&good](const char* key, std::optional<Value> value) {
    Fields fields = good;
    fields.erase(key);
    if (value) fields.emplace(key, *value);
    return errorOf(bytesOf(fields));
  };
  for (const auto& wrong : {std::optional<Value>(), std::optional(Value(FndNumber(100001UL))),
                            std::optional(Value(FndNumber(100000.0))), std::optional(text("1"))}) {
    EXPECT_EQ(errorWith("$version", wrong), damage("it is of another version"));
  }
  EXPECT_EQ(errorWith("$archiver", std::nullopt), damage("it names no archiver"));
  for (const auto& wrong :
       {std::optional<Value>(), std::optional(uid(kRoot)), std::optional(Value(Fields{})),
        std::optional(Value(Fields{{"root", text("5")}}))}) {
    EXPECT_EQ(errorWith("$top", wrong), damage("it has no root"));
  }
  for (const auto& wrong :
       {std::optional<Value>(), std::optional(Value(Objects{})), std::optional(text("$null")),
        std::optional(Value(Objects{uid(0)})), std::optional(Value(Objects{text("null")}))}) {
    EXPECT_EQ(errorWith("$objects", wrong), damage("it has no objects"));
  }
  const auto notADictionary = binaryPropertyListFromValue(Value(Objects{}));
  EXPECT_EQ(errorOf(*notADictionary), damage("it is no dictionary"));
}

TEST(HostileKeyedArchive, InstancesWithoutTheirPartsAreRefused) {
  EXPECT_EQ(errorOf(archiveOf({Value(Fields{})})), damage("an object without a class (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({Value(Objects{})})), damage("an object without a class (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({uid(1)})), damage("an object without a class (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({instance(kListClass, {})})),
            damage("a list without its elements (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({list({text("a")})})),
            damage("an element that is no reference (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({dictionary({uid(6)}, {}), text("a")})),
            damage("a dictionary without as many keys as elements (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({dictionary({uid(kRoot)}, {uid(6)}), text("a")})),
            damage("a key that is no string (object 5)"));
  EXPECT_EQ(
      errorOf(archiveOf({dictionary({uid(6), uid(7)}, {uid(6), uid(6)}), text("a"), text("a")})),
      damage("a key that stands twice (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({instance(kDateClass, {})})),
            damage("a date without its time (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({instance(kDateClass, {{"Fnd.time", Value(FndNumber(true))}})})),
            damage("a date without its time (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({instance(6, {}), Value(Fields{{"$classname", text("FndArray")}})})),
            damage("a class without a name (object 5)"));
  EXPECT_EQ(errorOf(archiveOf({instance(kRecordClass, {{"a", Value(Objects{})}})})),
            damage("an object without a class (object 0)"));
}

TEST(HostileKeyedArchive, DatesThatAreNoMomentAreRefused) {
  for (const double time :
       {std::numeric_limits<double>::infinity(), -std::numeric_limits<double>::infinity(),
        std::numeric_limits<double>::quiet_NaN(), 1e300, -1e300}) {
    EXPECT_EQ(errorOf(archiveOf({instance(kDateClass, {{"Fnd.time", Value(FndNumber(time))}})})),
              damage("a date that is no moment (object 5)"));
  }
}

TEST(HostileKeyedArchive, EveryTruncationAndEveryFlippedByteIsRefusedOrReadWithoutHarm) {
  const FndData good = archiveOf(
      {list({uid(6), uid(7), uid(8), uid(0)}), text("grün"),
       instance(kDateClass, {{"Fnd.time", Value(FndNumber(816979995.25))}}),
       dictionary({uid(6)}, {uid(9)}), instance(kRecordClass, {{"a", uid(6)}, {"b", text("c")}})});
  ASSERT_TRUE(decoded(good));
  for (std::size_t length = 0; length < good.size(); ++length) {
    const FndData cut(good.begin(), good.begin() + static_cast<std::ptrdiff_t>(length));
    EXPECT_NE(errorOf(cut), "no error") << length;
  }
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

}  // namespace
}  // namespace vantrell
