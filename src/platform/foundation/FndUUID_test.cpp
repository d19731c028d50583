#include "platform/foundation/FndUUID.h"

#include <gtest/gtest.h>

#include <set>

namespace vantrell {
namespace {

TEST(FndUUID, TheCanonicalTextIsReadInEitherCaseAndWrittenInUpperCase) {
  const auto lower = FndUUID::fromString("01234567-89ab-cdef-0123-456789abcdef");
  const auto upper = FndUUID::fromString("01234567-89AB-CDEF-0123-456789ABCDEF");
  ASSERT_TRUE(lower);
  EXPECT_EQ(lower, upper);
  EXPECT_EQ(lower->description(), "01234567-89AB-CDEF-0123-456789ABCDEF");
  EXPECT_EQ(lower->bytes()[0], 0x01);
  EXPECT_EQ(lower->bytes()[15], 0xef);
}

TEST(FndUUID, AnythingElseIsNoUUID) {
  for (const char* text :
       {"", "01234567-89AB-CDEF-0123-456789ABCDE", "01234567-89AB-CDEF-0123-456789ABCDEF0",
        "0123456789AB-CDEF-0123-456789ABCDEF-", "01234567089AB0CDEF001230456789ABCDEF",
        "01234567-89AB-CDEF-0123-456789ABCDEG", "{1234567-89AB-CDEF-0123-456789ABCDE}",
        "01234567-89AB-CDEF-0123_456789ABCDEF", "-1234567-89AB-CDEF-0123-456789ABCDEF"}) {
    EXPECT_FALSE(FndUUID::fromString(text)) << text;
  }
}

TEST(FndUUID, RandomOnesAreOfVersion4AndDiffer) {
  std::set<FndUUID> all;
  for (int i = 0; i < 1000; ++i) {
    const FndUUID uuid = FndUUID::random();
    EXPECT_EQ(uuid.bytes()[6] & 0xf0, 0x40);
    EXPECT_EQ(uuid.bytes()[8] & 0xc0, 0x80);
    EXPECT_EQ(FndUUID::fromString(uuid.description()), uuid);
    all.insert(uuid);
  }
  EXPECT_EQ(all.size(), 1000U);
}

TEST(FndUUID, OnlyTheOneOfZerosIsZero) {
  EXPECT_TRUE(FndUUID::fromString("00000000-0000-0000-0000-000000000000")->isZero());
  EXPECT_FALSE(FndUUID::fromString("00000000-0000-0000-0000-000000000001")->isZero());
}

}  // namespace
}  // namespace vantrell
