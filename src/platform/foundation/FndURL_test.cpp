#include "platform/foundation/FndURL.h"

#include <gtest/gtest.h>

#include <atomic>
#include <set>
#include <thread>

namespace vantrell {
namespace {

FndURL file(std::string_view path) { return FndURL::fileURLWithPath(path); }

TEST(FndURL, SlashesAndDotsAreFoldedAndDoubleDotsStay) {
  const struct {
    const char* given;
    const char* path;
    const char* standardized;
  } kRows[] = {
      {"/a/b", "/a/b", "/a/b"},
      {"/a/b/", "/a/b", "/a/b"},
      {"//a///b//", "/a/b", "/a/b"},
      {"/./a/./b/.", "/a/b", "/a/b"},
      {"a/b", "/a/b", "/a/b"},
      {"", "/", "/"},
      {"/", "/", "/"},
      {"/.", "/", "/"},
      {"/a/../b", "/a/../b", "/b"},
      {"/..", "/..", "/"},
      {"/../../a", "/../../a", "/a"},
      {"/a/...", "/a/...", "/a/..."},
      {"/a/.hidden", "/a/.hidden", "/a/.hidden"},
  };
  for (const auto& row : kRows) {
    EXPECT_EQ(file(row.given).path(), row.path) << row.given;
    EXPECT_EQ(file(row.given).standardizedPath(), row.standardized) << row.given;
  }
}

TEST(FndURL, OnlyAComponentOfTwoDotsIsAParentReference) {
  for (const char* path : {"/..", "/a/..", "/a/../b"}) {
    EXPECT_TRUE(file(path).hasParentReference()) << path;
  }
  for (const char* path : {"/", "/a", "/...", "/a..", "/..a/b", "/a/."}) {
    EXPECT_FALSE(file(path).hasParentReference()) << path;
  }
  EXPECT_FALSE(FndURL::URLWithString("x:/../a")->hasParentReference());
}

TEST(FndURL, ComponentsBeginWithTheRoot) {
  using Components = std::vector<std::string>;
  EXPECT_EQ(file("/a/b c").pathComponents(), (Components{"/", "a", "b c"}));
  EXPECT_EQ(file("/").pathComponents(), Components{"/"});
  EXPECT_EQ(FndURL::URLWithString("https://host/a")->pathComponents(), Components{});
  EXPECT_EQ(file("/a/b c").lastPathComponent(), "b c");
  EXPECT_EQ(file("/").lastPathComponent(), "/");
}

TEST(FndURL, ComponentsAreAppendedAndTakenOff) {
  EXPECT_EQ(file("/a").URLByAppendingPathComponent("b").path(), "/a/b");
  EXPECT_EQ(file("/").URLByAppendingPathComponent("b").path(), "/b");
  EXPECT_EQ(file("/a").URLByAppendingPathComponent("b/c/").path(), "/a/b/c");
  EXPECT_EQ(file("/a/b").URLByDeletingLastPathComponent().path(), "/a");
  EXPECT_EQ(file("/a").URLByDeletingLastPathComponent().path(), "/");
  EXPECT_EQ(file("/").URLByDeletingLastPathComponent().path(), "/");
}

TEST(FndURL, EveryByteOfAPathSurvivesEscaping) {
  std::string path = "/";
  for (int byte = 1; byte < 256; ++byte) path += {'x', static_cast<char>(byte)};
  path += "/%41%2f%";
  const FndURL url = file(path);
  EXPECT_EQ(FndURL::URLWithString(url.description()), url);
  EXPECT_EQ(file("/a b%ü").description(), "file:///a%20b%25%C3%BC");
}

TEST(FndURL, TextWithAFileSchemeIsAPath) {
  EXPECT_EQ(FndURL::URLWithString("file:///a%20b"), file("/a b"));
  EXPECT_EQ(FndURL::URLWithString("file://localhost/a"), file("/a"));
  EXPECT_EQ(FndURL::URLWithString("file:/a"), file("/a"));
  EXPECT_EQ(FndURL::URLWithString("file:///"), file("/"));
  EXPECT_EQ(FndURL::URLWithString("file:///a%2")->path(), "/a%2");
  EXPECT_EQ(FndURL::URLWithString("file:///a%zz")->path(), "/a%zz");
  EXPECT_FALSE(FndURL::URLWithString("file://host"));
  EXPECT_FALSE(FndURL::URLWithString("file:///a%00b"));
}

TEST(FndURL, AnotherSchemeHasNoPath) {
  const auto url = FndURL::URLWithString("https://host/a");
  ASSERT_TRUE(url);
  EXPECT_FALSE(url->isFileURL());
  EXPECT_EQ(url->path(), "");
  EXPECT_EQ(url->description(), "https://host/a");
}

TEST(FndURL, TextWithoutASchemeIsNoURL) {
  for (const char* text : {"", ":", "/a", "a/b", "/a:b", "a/b:c", "1a:b", "a b:c"}) {
    EXPECT_FALSE(FndURL::URLWithString(text)) << text;
  }
}

TEST(FndURL, NamesThatAreNoUTF8AreCarriedWithoutLoss) {
  const FndURL url = file("/a\xff\xfe/\xc3");
  EXPECT_EQ(url.path(), "/a\xff\xfe/\xc3");
  EXPECT_EQ(url.description(), "file:///a%FF%FE/%C3");
  EXPECT_EQ(url.lastPathComponent(), "\xc3");
}

TEST(FndURL, EqualAndOrderedByTheirPaths) {
  EXPECT_EQ(file("/a/"), file("/a"));
  EXPECT_NE(file("/a"), file("/A"));
  const std::set<FndURL> sorted = {file("/b"), file("/a/b"), file("/a"), file("/a")};
  EXPECT_EQ(sorted.size(), 3U);
  EXPECT_EQ(sorted.begin()->path(), "/a");
  EXPECT_NE(*FndURL::URLWithString("x:/a"), file("/a"));
}

TEST(FndURL, CopiesShareTheirResourceValuesAndOthersDoNot) {
  const FndURL one = file("/a");
  const FndURL copy = one;
  const FndURL other = file("/a");
  EXPECT_FALSE(one.cachedResourceValue(FndURLResourceKey::Name));
  copy.setCachedResourceValue(FndURLResourceKey::Name, std::string("a"));
  EXPECT_EQ(std::get<std::string>(*one.cachedResourceValue(FndURLResourceKey::Name)), "a");
  one.setCachedResourceValue(FndURLResourceKey::Name, std::string("b"));
  EXPECT_EQ(std::get<std::string>(*copy.cachedResourceValue(FndURLResourceKey::Name)), "b");
  EXPECT_FALSE(copy.cachedResourceValue(FndURLResourceKey::FileSize));
  EXPECT_FALSE(other.cachedResourceValue(FndURLResourceKey::Name));
}

TEST(FndURL, EachResourceKeyHasANameOfItsOwn) {
  std::set<std::string_view> names;
  for (int i = 0; i <= static_cast<int>(FndURLResourceKey::ContentVersion); ++i) {
    names.insert(resourceKeyName(static_cast<FndURLResourceKey>(i)));
  }
  EXPECT_EQ(names.size(), 14U);
  EXPECT_EQ(resourceKeyName(FndURLResourceKey::ContentVersion), "FndURLContentVersionKey");
  EXPECT_EQ(resourceKeyName(FndURLResourceKey::Name), "FndURLNameKey");
}

TEST(FndURLConcurrency, ManyThreadsUseTheCacheOfOneObject) {
  const FndURL url = file("/a");
  std::atomic<int> wrong = 0;
  {
    std::vector<std::jthread> threads;
    for (std::uint64_t t = 0; t < 4; ++t) {
      threads.emplace_back([url, t, &wrong] {
        for (int i = 0; i < 2000; ++i) {
          url.setCachedResourceValue(FndURLResourceKey::FileSize, FndNumber(t));
          const auto value = url.cachedResourceValue(FndURLResourceKey::FileSize);
          if (!value || *std::get<FndNumber>(*value).exactUInt64() > 3) ++wrong;
        }
      });
    }
  }
  EXPECT_EQ(wrong, 0);
}

TEST(DisplayText, WhatIsNoTextIsEscaped) {
  EXPECT_EQ(displayText("grün 😀"), "grün 😀");
  EXPECT_EQ(displayText(std::string_view("a\0b\n\x1b[31m\x7f", 10)), "a\\x00b\\x0A\\x1B[31m\\x7F");
  EXPECT_EQ(displayText("\xff\xc3"), "\\xFF\\xC3");
  EXPECT_EQ(displayText("\xe2\x82"), "\\xE2\\x82");
  EXPECT_EQ(displayText("\xc0\xaf"), "\\xC0\\xAF");
  EXPECT_EQ(displayText("\xed\xa0\x80"), "\\xED\\xA0\\x80");
  EXPECT_EQ(displayText("\xf4\x90\x80\x80"), "\\xF4\\x90\\x80\\x80");
  EXPECT_EQ(displayText(""), "");
}

TEST(DisplayText, ControlCharactersOfTwoBytesAreEscapedToo) {
  EXPECT_EQ(displayText("a\u009b31m"), "a\\xC2\\x9B31m");
  EXPECT_EQ(displayText("\u0080\u009f\u00a0"), "\\xC2\\x80\\xC2\\x9F\u00a0");
}

}  // namespace
}  // namespace vantrell
