#include "cli/Base64.h"

#include <gtest/gtest.h>

#include <string_view>

namespace vantrell::cli {
namespace {

std::string encoded(std::string_view text) { return base64(FndData(text.begin(), text.end())); }

TEST(Base64, TheExamplesOfTheStandardComeOut) {
  EXPECT_EQ(encoded(""), "");
  EXPECT_EQ(encoded("f"), "Zg==");
  EXPECT_EQ(encoded("fo"), "Zm8=");
  EXPECT_EQ(encoded("foo"), "Zm9v");
  EXPECT_EQ(encoded("foob"), "Zm9vYg==");
  EXPECT_EQ(encoded("fooba"), "Zm9vYmE=");
  EXPECT_EQ(encoded("foobar"), "Zm9vYmFy");
}

TEST(Base64, EveryBitOfAByteCounts) {
  EXPECT_EQ(base64(FndData{0xff, 0xff, 0xff}), "////");
  EXPECT_EQ(base64(FndData{0xfb, 0xf0, 0x00}), "+/AA");
}

}  // namespace
}  // namespace vantrell::cli
