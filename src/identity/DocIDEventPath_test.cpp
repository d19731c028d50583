#include "identity/DocIDEventPath.h"

#include <gtest/gtest.h>

#include <string>

namespace vantrell {
namespace {

TEST(DocIDEventPath, EachFieldIsRead) {
  EXPECT_EQ(parseDocIDEventPath("/.docid/42/changed/7/src=18446744073709551615,dst=9"),
            (DocIDEvent{DeviceID{42}, DocumentID{7}, FileID{18446744073709551615ULL}, FileID{9}}));
}

TEST(DocIDEventPath, ADestinationOf0SaysThatTheDocumentIsGone) {
  const auto event = parseDocIDEventPath("/.docid/42/changed/7/src=5,dst=0");
  ASSERT_TRUE(event);
  EXPECT_EQ(event->destination, FileID{0});
}

TEST(DocIDEventPath, APathMissingAFieldIsRefused) {
  for (const std::string_view path :
       {"", "/.docid/", "/.docid/42", "/.docid/42/changed", "/.docid/42/changed/7",
        "/.docid/42/changed/7/src=5", "/.docid/42/changed/7/src=5,dst=",
        "/.docid/42/changed/7/src=,dst=5", "/.docid/42/changed//src=5,dst=6",
        "/.docid//changed/7/src=5,dst=6", "/.docid/42/7/src=5,dst=6",
        "/.docid/42/changed/7/dst=6,src=5", ".docid/42/changed/7/src=5,dst=6"}) {
    EXPECT_EQ(parseDocIDEventPath(path), std::nullopt) << path;
  }
}

TEST(DocIDEventPath, ANumberOfAnotherFormIsRefused) {
  for (const std::string_view path :
       {"/.docid/-1/changed/7/src=5,dst=6", "/.docid/42/changed/+7/src=5,dst=6",
        "/.docid/42/changed/ 7/src=5,dst=6", "/.docid/42/changed/0x7/src=5,dst=6",
        "/.docid/42/changed/4294967296/src=5,dst=6",
        "/.docid/42/changed/7/src=18446744073709551616,dst=6", "/.docid/42/changed/7/src=5,dst=6/",
        "/.docid/42/changed/7/src=5,dst=6 "}) {
    EXPECT_EQ(parseDocIDEventPath(path), std::nullopt) << path;
  }
}

TEST(DocIDEventPath, EveryTruncationIsRefused) {
  const std::string whole = "/.docid/42/changed/7/src=5,dst=6";
  for (std::size_t length = 0; length < whole.size(); ++length) {
    EXPECT_EQ(parseDocIDEventPath(whole.substr(0, length)), std::nullopt) << length;
  }
}

}  // namespace
}  // namespace vantrell
