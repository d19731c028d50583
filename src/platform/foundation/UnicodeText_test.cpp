#include "platform/foundation/UnicodeText.h"

#include <gtest/gtest.h>

namespace vantrell {
namespace {

std::string utf8Of(char32_t value) {
  FndData units;
  const auto append = [&units](char32_t unit) {
    units.push_back(static_cast<std::uint8_t>(unit >> 8));
    units.push_back(static_cast<std::uint8_t>(unit));
  };
  if (value < 0x10000) {
    append(value);
  } else {
    append(0xd800 + ((value - 0x10000) >> 10));
    append(0xdc00 + ((value - 0x10000) & 0x3ff));
  }
  return utf8FromUTF16(units).value_or("refused");
}

TEST(UnicodeText, EveryCodePointGoesThroughBothForms) {
  for (char32_t value = 0; value <= 0x10ffff; ++value) {
    const std::string text = utf8Of(value);
    if (value >= 0xd800 && value <= 0xdfff) {
      ASSERT_EQ(text, "refused");
      continue;
    }
    const std::size_t length = value < 0x80 ? 1 : value < 0x800 ? 2 : value < 0x10000 ? 3 : 4;
    ASSERT_EQ(text.size(), length) << std::uint32_t{value};
    ASSERT_EQ(utf8SequenceLength(text), length) << std::uint32_t{value};
    const auto units = utf16FromUTF8(text);
    ASSERT_TRUE(units) << std::uint32_t{value};
    ASSERT_EQ(utf8FromUTF16(*units), text) << std::uint32_t{value};
  }
}

TEST(UnicodeText, MalformedSequencesHaveNoLengthAndNoUTF16) {
  for (const char* text : {"\x80", "\xbf", "\xc0\x80", "\xc1\xbf", "\xc2", "\xc2\x41",
                           "\xe0\x9f\xbf", "\xe2\x82", "\xed\xa0\x80", "\xed\xbf\xbf",
                           "\xf0\x8f\xbf\xbf", "\xf4\x90\x80\x80", "\xf5\x80\x80\x80", "\xff"}) {
    EXPECT_EQ(utf8SequenceLength(text), 0U);
    EXPECT_FALSE(utf16FromUTF8(text));
    EXPECT_FALSE(utf16FromUTF8(std::string("a") + text));
  }
}

}  // namespace
}  // namespace vantrell
