#include "platform/foundation/FndNumber.h"

#include <gtest/gtest.h>

#include <limits>

namespace vantrell {
namespace {

constexpr std::int64_t kLeast = std::numeric_limits<std::int64_t>::min();
constexpr std::int64_t kGreatest = std::numeric_limits<std::int64_t>::max();

TEST(FndNumber, IntegersAreEqualWhateverTheirSignWhenTheyWereMade) {
  EXPECT_EQ(FndNumber(std::int64_t{7}), FndNumber(std::uint64_t{7}));
  EXPECT_NE(FndNumber(std::int64_t{-1}), FndNumber(UINT64_MAX));
}

TEST(FndNumber, ATruthValueAnIntegerAndARealAreNeverEqual) {
  EXPECT_NE(FndNumber(true), FndNumber(std::uint64_t{1}));
  EXPECT_NE(FndNumber(1.0), FndNumber(std::uint64_t{1}));
  EXPECT_NE(FndNumber(1.0), FndNumber(true));
}

TEST(FndNumber, AnExactValueIsGivenOnlyWhereItFits) {
  EXPECT_EQ(FndNumber(UINT64_MAX).exactUInt64(), UINT64_MAX);
  EXPECT_FALSE(FndNumber(UINT64_MAX).exactInt64());
  EXPECT_EQ(FndNumber(kGreatest).exactInt64(), kGreatest);
  EXPECT_EQ(FndNumber(kLeast).exactInt64(), kLeast);
  EXPECT_FALSE(FndNumber(kLeast).exactUInt64());
  for (const FndNumber& other : {FndNumber(1.0), FndNumber(true)}) {
    EXPECT_FALSE(other.exactUInt64());
    EXPECT_FALSE(other.exactInt64());
  }
}

TEST(FndNumber, EveryNumberHasANearestDouble) {
  EXPECT_EQ(FndNumber(true).doubleValue(), 1.0);
  EXPECT_EQ(FndNumber(std::int64_t{-3}).doubleValue(), -3.0);
  EXPECT_EQ(FndNumber(UINT64_MAX).doubleValue(), 18446744073709551616.0);
  EXPECT_EQ(FndNumber(2.5).doubleValue(), 2.5);
}

TEST(FndNumber, DescriptionsAreDecimalOrATruthValue) {
  EXPECT_EQ(FndNumber(true).description(), "true");
  EXPECT_EQ(FndNumber(false).description(), "false");
  EXPECT_EQ(FndNumber(kLeast).description(), "-9223372036854775808");
  EXPECT_EQ(FndNumber(UINT64_MAX).description(), "18446744073709551615");
  EXPECT_EQ(FndNumber(2.5).description(), "2.5");
}

TEST(FndNumber, EachNumberKnowsItsKind) {
  EXPECT_TRUE(FndNumber(true).isBool());
  EXPECT_TRUE(FndNumber(0.0).isReal());
  EXPECT_TRUE(FndNumber(kLeast).isInteger());
  EXPECT_FALSE(FndNumber(true).isInteger());
  EXPECT_FALSE(FndNumber(0.0).isInteger());
}

}  // namespace
}  // namespace vantrell
