#include <gtest/gtest.h>

#include <ctime>
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

constexpr std::clock_t kPatience = 60 * CLOCKS_PER_SEC;  // of the processor, not of the wall
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

// A large archive, put together object by object: UID 0 is null, UID 1 the class of lists.
class RawArchive {
 public:
  RawArchive() {
    const std::uint64_t name = raw.addString("FndArray");
    add(raw.addString("$null"));
    add(raw.addDictionary({raw.addString("$classname"), raw.addString("$classes")},
                          {name, raw.addArray({name})}));
  }

  /// Gives `object` the next UID.
  void add(std::uint64_t object) { _objects.push_back(object); }

  std::uint64_t list(const std::vector<std::uint32_t>& uids) {
    RawPropertyList::References elements;
    for (const std::uint32_t element : uids) elements.push_back(uidObject(element));
    return raw.addDictionary({_classKey, _elementsKey}, {_listClass, raw.addArray(elements)});
  }

  std::uint64_t listOfNulls(std::size_t count) {
    const RawPropertyList::References nulls(count, uidObject(0));
    return raw.addDictionary({_classKey, _elementsKey}, {_listClass, raw.addArray(nulls)});
  }

  FndData bytes(std::uint32_t root) {
    const std::uint64_t top = raw.addDictionary({raw.addString("root")}, {uidObject(root)});
    raw.setTop(raw.addDictionary({raw.addString("$version"), raw.addString("$archiver"),
                                  raw.addString("$top"), raw.addString("$objects")},
                                 {raw.add(bytesFromHex("12 000186a0")),
                                  raw.addString("FndKeyedArchiver"), top, raw.addArray(_objects)}));
    return raw.bytes();
  }

  RawPropertyList raw{3};

 private:
  std::uint64_t uidObject(std::uint32_t uidValue) {
    FndData object = {0x83};
    const FndData bytes = bigEndianBytes(uidValue, 4);
    object.insert(object.end(), bytes.begin(), bytes.end());
    return raw.add(std::move(object));
  }

  const std::uint64_t _classKey = raw.addString("$class");
  const std::uint64_t _elementsKey = raw.addString("Fnd.objects");
  const std::uint64_t _listClass = uidObject(1);
  RawPropertyList::References _objects;
};

// The first UID that a `RawArchive` gives.
constexpr std::uint32_t kFirst = 2;

Result<ArchiveValue> decoded(const FndData& bytes) {
  const std::clock_t start = std::clock();
  const MemoryMeter meter;
  auto value = unarchivedObjectOfClasses(
      bytes,
      {ArchiveClass::Null, ArchiveClass::Number, ArchiveClass::String, ArchiveClass::Date,
       ArchiveClass::Data, ArchiveClass::List, ArchiveClass::Dictionary, ArchiveClass::Record});
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
  RawArchive archive;
  for (std::uint32_t i = 0; i < kDepth; ++i) archive.add(archive.list({kFirst + i + 1}));
  archive.add(archive.list({}));
  EXPECT_NE(errorOf(archive.bytes(kFirst)).find("it is nested too deep"), std::string::npos);
}

TEST(HostileKeyedArchive, ADepthOf200000ThatIsReadFromBelowIsRefused) {
  constexpr std::uint32_t kDepth = 200000;
  RawArchive archive;
  std::vector<std::uint32_t> all;
  archive.add(archive.list({}));
  for (std::uint32_t i = 0; i < kDepth; ++i) {
    archive.add(archive.list({kFirst + i}));
    all.push_back(kFirst + i);
  }
  archive.add(archive.list(all));  // each level is known when the next one asks for it
  EXPECT_NE(errorOf(archive.bytes(kFirst + kDepth + 1)).find("it is nested too deep"),
            std::string::npos);
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

// An archive whose root lists what is one object of the property list at many places.
FndData archiveOfManyTimes(RawArchive& archive, std::uint64_t object) {
  constexpr std::uint32_t kTimes = 5000;
  std::vector<std::uint32_t> all;
  for (std::uint32_t i = 0; i < kTimes; ++i) {
    archive.add(object);
    all.push_back(kFirst + i);
  }
  archive.add(archive.list(all));
  return archive.bytes(kFirst + kTimes);
}

TEST(HostileKeyedArchive, AHugeStringThatIsManyObjectsIsRefused) {
  RawArchive archive;
  const std::uint64_t huge = archive.raw.addString(std::string(1 << 20, 'h'));
  EXPECT_EQ(errorOf(archiveOfManyTimes(archive, huge)), damage(kUnfolds));
}

TEST(HostileKeyedArchive, AHugeListThatIsManyObjectsIsRefused) {
  RawArchive archive;
  const std::uint64_t huge = archive.listOfNulls(20000);
  EXPECT_EQ(errorOf(archiveOfManyTimes(archive, huge)), damage(kUnfolds));
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

TEST(HostileKeyedArchive, AnInstanceOfAClassThatHasNoneIsRefused) {
  for (const char* name : {"FndNull", "FndNumber", "FndString", "FndData", "FndObject"}) {
    EXPECT_EQ(errorOf(archiveOf({instance(kRoot + 1, {}), classNamed(name)})),
              damage("an instance that is no record (object 5)"));
  }
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
