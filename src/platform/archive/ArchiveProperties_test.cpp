#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <numeric>
#include <random>

#include "platform/archive/KeyedArchive.h"
#include "platform/archive/PropertyList.h"
#include "tests/support/RandomSeed.h"

namespace vantrell {
namespace {

constexpr int kDeepest = 5;

class ArchiveProperties : public testing::Test {
 protected:
  ArchiveProperties() { randomSeed(); }
};

// One, two, three and four bytes in UTF-8, one and two units in UTF-16.
rc::Gen<std::string> anyText() {
  static const std::vector<std::string> kPieces = {
      "a", "Z", "$", "/", " ", "\n", std::string(1, '\0'), "ü", "\u07ff", "\u0800", "\uffff", "😀"};
  return rc::gen::map(rc::gen::container<std::vector<std::string>>(rc::gen::elementOf(kPieces)),
                      [](const auto& pieces) {
                        return std::accumulate(pieces.begin(), pieces.end(), std::string());
                      });
}

rc::Gen<FndNumber> anyNumber() {
  return rc::gen::oneOf(
      rc::gen::map(rc::gen::arbitrary<std::uint64_t>(), [](auto v) { return FndNumber(v); }),
      rc::gen::map(rc::gen::arbitrary<std::int64_t>(), [](auto v) { return FndNumber(v); }),
      rc::gen::map(rc::gen::arbitrary<double>(), [](auto v) { return FndNumber(v); }),
      rc::gen::map(rc::gen::arbitrary<bool>(), [](auto v) { return FndNumber(v); }));
}

// A date that a double holds exactly, as every date of an archive does.
rc::Gen<FndDate> anyDate() {
  return rc::gen::map(
      rc::gen::inRange<std::int64_t>(-4000000000LL, 4000000000LL), [](auto eighths) {
        return *FndDate::fromSecondsSinceReferenceDate(static_cast<double>(eighths) / 8);
      });
}

rc::Gen<FndData> anyData() { return rc::gen::arbitrary<FndData>(); }

rc::Gen<PropertyListValue> anyPropertyList(int depth);

rc::Gen<PropertyListValue> anyPropertyListScalar() {
  const auto wrapped = [](auto value) { return PropertyListValue(std::move(value)); };
  return rc::gen::oneOf(rc::gen::map(anyText(), wrapped), rc::gen::map(anyNumber(), wrapped),
                        rc::gen::map(anyDate(), wrapped), rc::gen::map(anyData(), wrapped),
                        rc::gen::map(rc::gen::arbitrary<std::uint32_t>(),
                                     [](auto v) { return PropertyListValue(PropertyListUID{v}); }));
}

rc::Gen<PropertyListValue> anyPropertyList(int depth) {
  if (depth == 0) return anyPropertyListScalar();
  const auto element = rc::gen::lazy([depth] { return anyPropertyList(depth - 1); });
  const auto wrapped = [](auto value) { return PropertyListValue(std::move(value)); };
  using Entry = std::pair<std::string, PropertyListValue>;
  return rc::gen::oneOf(
      anyPropertyListScalar(),
      rc::gen::map(rc::gen::scale(0.1, rc::gen::container<PropertyListValue::Array>(element)),
                   wrapped),
      rc::gen::map(
          rc::gen::scale(0.1,
                         rc::gen::container<std::vector<Entry>>(rc::gen::pair(anyText(), element))),
          [](const std::vector<Entry>& entries) {
            return PropertyListValue(PropertyListValue::Dictionary(entries.begin(), entries.end()));
          }));
}

rc::Gen<ArchiveValue> anyArchive(int depth);

rc::Gen<ArchiveValue::Dictionary> anyFields(int depth) {
  using Entry = std::pair<std::string, ArchiveValue>;
  const auto element = rc::gen::lazy([depth] { return anyArchive(depth); });
  return rc::gen::map(rc::gen::scale(0.1, rc::gen::container<std::vector<Entry>>(
                                              rc::gen::pair(anyText(), element))),
                      [](const std::vector<Entry>& entries) {
                        return ArchiveValue::Dictionary(entries.begin(), entries.end());
                      });
}

rc::Gen<ArchiveValue> anyArchiveScalar() {
  const auto wrapped = [](auto value) { return ArchiveValue(std::move(value)); };
  return rc::gen::oneOf(rc::gen::just(ArchiveValue()), rc::gen::map(anyText(), wrapped),
                        rc::gen::map(anyNumber(), wrapped), rc::gen::map(anyDate(), wrapped),
                        rc::gen::map(anyData(), wrapped));
}

rc::Gen<ArchiveValue> anyArchive(int depth) {
  if (depth == 0) return anyArchiveScalar();
  const auto element = rc::gen::lazy([depth] { return anyArchive(depth - 1); });
  const auto wrapped = [](auto value) { return ArchiveValue(std::move(value)); };
  return rc::gen::oneOf(
      anyArchiveScalar(),
      rc::gen::map(rc::gen::scale(0.1, rc::gen::container<ArchiveValue::List>(element)), wrapped),
      rc::gen::map(anyFields(depth - 1), wrapped),
      rc::gen::map(rc::gen::pair(anyText(), anyFields(depth - 1)), [](const auto& parts) {
        return ArchiveValue(ArchiveValue::Record{"App" + parts.first, parts.second});
      }));
}

Result<ArchiveValue> unarchived(FndDataView bytes) {
  return unarchivedObjectOfClasses(
      bytes,
      {ArchiveClass::Null, ArchiveClass::Number, ArchiveClass::String, ArchiveClass::Date,
       ArchiveClass::Data, ArchiveClass::List, ArchiveClass::Dictionary, ArchiveClass::Record});
}

TEST_F(ArchiveProperties, PropertyListsRoundTripAndTheirEncodingIsStable) {
  EXPECT_TRUE(rc::check([] {
    const PropertyListValue value(
        *rc::gen::container<PropertyListValue::Array>(anyPropertyList(kDeepest)));
    const auto bytes = binaryPropertyListFromValue(value);
    RC_ASSERT(bytes.has_value());
    const auto back = valueFromBinaryPropertyList(*bytes);
    RC_ASSERT(back.has_value());
    RC_ASSERT(*back == value);
    RC_ASSERT(*binaryPropertyListFromValue(*back) == *bytes);
  }));
}

TEST_F(ArchiveProperties, ArchivesRoundTripAndTheirEncodingIsStable) {
  EXPECT_TRUE(rc::check([] {
    const ArchiveValue value(*rc::gen::container<ArchiveValue::List>(anyArchive(kDeepest)));
    const auto bytes = archivedDataWithRootObject(value);
    RC_ASSERT(bytes.has_value());
    const auto back = unarchived(*bytes);
    RC_ASSERT(back.has_value());
    RC_ASSERT(*back == value);
    RC_ASSERT(*archivedDataWithRootObject(*back) == *bytes);
  }));
}

TEST_F(ArchiveProperties, AnyDateIsStableOnceItHasBeenThroughAnArchive) {
  EXPECT_TRUE(rc::check([](std::uint32_t nanoseconds) {
    const auto seconds = *rc::gen::inRange<std::int64_t>(-62135596800LL, 253402300799LL);
    const auto date = FndDate::fromUnixTime(seconds, nanoseconds % 1000000000);
    const auto bytes = archivedDataWithRootObject(ArchiveValue(date));
    const auto once = unarchived(*bytes);
    RC_ASSERT(once.has_value());
    RC_ASSERT(*archivedDataWithRootObject(*once) == *bytes);
    RC_ASSERT(once->date()->unixSeconds() - seconds <= 1);
    RC_ASSERT(seconds - once->date()->unixSeconds() <= 1);
  }));
}

TEST_F(ArchiveProperties, RandomFlipsInAnArchiveDoNoHarm) {
  std::mt19937_64 random(randomSeed());
  std::size_t read = 0;
  std::size_t refused = 0;
  const auto good = archivedDataWithRootObject(ArchiveValue(ArchiveValue::List{
      ArchiveValue(std::string("Red")), ArchiveValue(FndDate::fromUnixTime(1)),
      ArchiveValue(ArchiveValue::Dictionary{{"a", ArchiveValue(FndNumber(true))}})}));
  ASSERT_TRUE(good);
  for (int round = 0; round < 20000; ++round) {
    FndData bytes = *good;
    for (std::uint64_t flips = 1 + random() % 8; flips > 0; --flips) {
      bytes[random() % bytes.size()] = static_cast<std::uint8_t>(random());
    }
    const auto value = unarchived(bytes);
    (value ? read : refused) += 1;
    EXPECT_TRUE(!value || archivedDataWithRootObject(*value));
  }
  EXPECT_GT(read, 0U);
  EXPECT_GT(refused, read);
}

}  // namespace
}  // namespace vantrell
