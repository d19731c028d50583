#include "enumeration/FSChangeToken.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <limits>

#include "platform/archive/PropertyList.h"
#include "platform/dochost/DochostErrors.h"
#include "tests/fakes/TestSystem.h"
#include "tests/support/RandomSeed.h"

namespace vantrell {
namespace {

using CodingKeys = FSChangeToken::CodingKeys;
using Dictionary = PropertyListValue::Dictionary;

const FndUUID kUUID = *FndUUID::fromString("0F1E2D3C-4B5A-6978-8796-A5B4C3D2E1F0");

FSChangeToken tokenOf(std::uint64_t version, std::uint64_t event, std::uint64_t offset,
                      std::uint64_t libraries) {
  return {.version = version,
          .deviceUUID = kUUID,
          .streamEventID = EventID{event},
          .offset = offset,
          .appLibraryVersionToken = libraries};
}

FndData listOf(Dictionary fields) {
  return *binaryPropertyListFromValue(PropertyListValue(std::move(fields)));
}

Dictionary goodFields() {
  Dictionary fields;
  for (const char* key : {"v", "s", "o", "a"}) {
    fields.emplace(key, PropertyListValue(FndNumber(std::uint64_t{1})));
  }
  fields.emplace("d", PropertyListValue(kUUID.description()));
  return fields;
}

class FSChangeTokenTest : public testing::Test {
 protected:
  FSChangeTokenTest() { randomSeed(); }

  // The host gets the sync-anchor-expired error, and that line says why.
  void expectExpired(FndDataView data) {
    system.log.clear();
    const auto token = changeTokenFromAnchorData(data);
    ASSERT_FALSE(token);
    EXPECT_TRUE(token.error().is(kDochostErrorDomain, -1002));
    EXPECT_EQ(
        system.log.textsAt(LogLevel::Error),
        std::vector<std::string>{"[ERROR] can't create change token from anchor data, resetting"});
  }

  TestSystem system;
};

TEST_F(FSChangeTokenTest, ATokenMadeWithAllZeroNumbersAndAGivenUUIDRoundTripsUnchanged) {
  const FSChangeToken token = tokenOf(0, 0, 0, 0);
  EXPECT_EQ(FSChangeToken::decoded(token.encoded()), token);
  EXPECT_EQ(changeTokenFromAnchorData(token.encoded()), token);
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(FSChangeTokenTest, EveryTokenRoundTrips) {
  EXPECT_TRUE(rc::check([](std::uint64_t version, std::uint64_t event, std::uint64_t offset,
                           std::uint64_t libraries, const std::array<std::uint8_t, 16>& uuid) {
    FSChangeToken token = tokenOf(version, event, offset, libraries);
    token.deviceUUID = FndUUID(uuid);
    const FndData data = token.encoded();
    RC_ASSERT(data.size() != 48U);
    RC_ASSERT((FSChangeToken::decoded(data) == token));
    RC_ASSERT(token.encoded() == data);
  }));
}

TEST_F(FSChangeTokenTest, TheLargestNumbersRoundTrip) {
  constexpr std::uint64_t kLargest = std::numeric_limits<std::uint64_t>::max();
  const FSChangeToken token = tokenOf(kLargest, kLargest, kLargest, kLargest);
  EXPECT_EQ(FSChangeToken::decoded(token.encoded()), token);
}

TEST_F(FSChangeTokenTest, ATokenIsABinaryPropertyListOfExactlyFiveKeys) {
  const FndData data = tokenOf(1, 2, 3, 4).encoded();
  EXPECT_EQ(std::string(data.begin(), data.begin() + 8), "bplist00");
  const auto root = valueFromBinaryPropertyList(data);
  ASSERT_TRUE(root);
  const Dictionary* fields = root->dictionary();
  ASSERT_NE(fields, nullptr);
  ASSERT_EQ(fields->size(), 5U);
  EXPECT_EQ(fields->at("v"), PropertyListValue(FndNumber(std::uint64_t{1})));
  EXPECT_EQ(fields->at("s"), PropertyListValue(FndNumber(std::uint64_t{2})));
  EXPECT_EQ(fields->at("o"), PropertyListValue(FndNumber(std::uint64_t{3})));
  EXPECT_EQ(fields->at("a"), PropertyListValue(FndNumber(std::uint64_t{4})));
  EXPECT_EQ(fields->at("d"),
            PropertyListValue(std::string("0F1E2D3C-4B5A-6978-8796-A5B4C3D2E1F0")));
}

TEST_F(FSChangeTokenTest,
       ABlobOfExactly48BytesWhateverItsContentIsAnsweredWithTheSyncAnchorExpiredError) {
  expectExpired(FndData(48));
  expectExpired(FndData(48, 0xff));
  // Even a well-formed list of that size.
  for (std::size_t length = 0; length < 16; ++length) {
    const FndData list = listOf({{"v", PropertyListValue(std::string(length, 'x'))}});
    if (list.size() == 48) expectExpired(list);
  }
}

TEST_F(FSChangeTokenTest,
       APropertyListHoldingOnlySomeOfTheFiveKeysIsAnsweredWithTheSyncAnchorExpiredError) {
  for (const char* missing : {"v", "d", "s", "o", "a"}) {
    Dictionary fields = goodFields();
    fields.erase(missing);
    expectExpired(listOf(std::move(fields)));
  }
  expectExpired(listOf({}));
}

TEST_F(FSChangeTokenTest, AValueOfTheWrongTypeIsRefused) {
  const std::vector<PropertyListValue> wrong = {
      PropertyListValue(std::string("1")), PropertyListValue(FndNumber(std::int64_t{-1})),
      PropertyListValue(FndNumber(1.0)),   PropertyListValue(FndNumber(true)),
      PropertyListValue(FndData{1}),       PropertyListValue(PropertyListValue::Array{})};
  for (const char* key : {"v", "s", "o", "a", "d"}) {
    for (const PropertyListValue& value : wrong) {
      Dictionary fields = goodFields();
      fields.insert_or_assign(key, value);
      expectExpired(listOf(std::move(fields)));
    }
  }
}

TEST_F(FSChangeTokenTest, AUUIDInAnotherFormIsRefused) {
  for (const std::string text : {"", "0F1E2D3C4B5A69788796A5B4C3D2E1F0",
                                 "0F1E2D3C-4B5A-6978-8796-A5B4C3D2E1F", "not a UUID"}) {
    Dictionary fields = goodFields();
    fields.insert_or_assign("d", PropertyListValue(text));
    expectExpired(listOf(std::move(fields)));
  }
}

TEST_F(FSChangeTokenTest, DataThatIsNoPropertyListIsRefused) {
  expectExpired(FndData{});
  expectExpired(FndData{1, 2, 3});
  expectExpired(dochostInitialPageSortedByName());
  expectExpired(*binaryPropertyListFromValue(PropertyListValue(std::string("text"))));
}

TEST_F(FSChangeTokenTest, EveryTruncationOfATokenIsRefused) {
  const FndData whole = tokenOf(1, 2, 3, 4).encoded();
  for (std::size_t length = 0; length < whole.size(); ++length) {
    EXPECT_FALSE(FSChangeToken::decoded(FndDataView(whole).first(length))) << length;
  }
}

TEST_F(FSChangeTokenTest, OtherKeysArePassedOver) {
  Dictionary fields = goodFields();
  fields.emplace("V", PropertyListValue(std::string("another key")));
  fields.emplace("version", PropertyListValue(std::string("another key")));
  EXPECT_EQ(FSChangeToken::decoded(listOf(std::move(fields))), tokenOf(1, 1, 1, 1));
}

TEST_F(FSChangeTokenTest, EncodedDataIsNeverExactly48BytesLong) {
  EXPECT_EQ(paddedAnchorData(FndData(47, 7)), FndData(47, 7));
  EXPECT_EQ(paddedAnchorData(FndData(49, 7)), FndData(49, 7));
  FndData padded(48, 7);
  padded.push_back(0);
  EXPECT_EQ(paddedAnchorData(FndData(48, 7)), padded);
}

TEST_F(FSChangeTokenTest, ATokenIsAcceptedWhateverItsVersion) {
  for (const std::uint64_t version : {std::uint64_t{0}, std::uint64_t{1}, UINT64_MAX}) {
    const FSChangeToken token = tokenOf(version, 5, 6, 7);
    EXPECT_EQ(changeTokenFromAnchorData(token.encoded()), token);
    EXPECT_TRUE(checkDeviceUUID(token, kUUID));
  }
}

TEST_F(FSChangeTokenTest, CodingKeysAreTheirLettersAndNothingElse) {
  EXPECT_EQ(stringValue(CodingKeys::version), "v");
  EXPECT_EQ(stringValue(CodingKeys::deviceUUID), "d");
  EXPECT_EQ(stringValue(CodingKeys::streamEventID), "s");
  EXPECT_EQ(stringValue(CodingKeys::offset), "o");
  EXPECT_EQ(stringValue(CodingKeys::appLibraryVersionToken), "a");
  EXPECT_EQ(codingKeyFromString("o"), CodingKeys::offset);
  for (const std::string_view string : {"", "V", "vv", "offset", "0", "x"}) {
    EXPECT_EQ(codingKeyFromString(string), std::nullopt) << string;
  }
}

TEST_F(FSChangeTokenTest, ASyncAnchorHasTheCurrentEventAndNoOffset) {
  EXPECT_EQ(FSChangeToken::syncAnchor(kUUID, EventID{9}), tokenOf(0, 9, 0, 0));
}

TEST_F(FSChangeTokenTest, APageHasTheEventOfItsListingAndItsOffset) {
  EXPECT_EQ(FSChangeToken::page(kUUID, EventID{9}, 200), tokenOf(0, 9, 200, 0));
}

TEST_F(FSChangeTokenTest, ATokenOfAnotherVolumeIsADebugLineAndTheSyncAnchorExpiredError) {
  const FndUUID current = *FndUUID::fromString("00000000-0000-0000-0000-000000000001");
  const auto checked = checkDeviceUUID(tokenOf(0, 1, 0, 0), current);
  ASSERT_FALSE(checked);
  EXPECT_TRUE(checked.error().is(kDochostErrorDomain, -1002));
  EXPECT_EQ(system.log.textsAt(LogLevel::Debug),
            std::vector<std::string>{
                "[DEBUG] device UUID changed (0F1E2D3C-4B5A-6978-8796-A5B4C3D2E1F0 -> "
                "00000000-0000-0000-0000-000000000001)"});
}

}  // namespace
}  // namespace vantrell
