#include "linux/types/GlobTable.h"

#include <gtest/gtest.h>

namespace vantrell::linuxos {
namespace {

std::string typeOf(std::vector<GlobRule> rules, std::string_view name) {
  return std::string(GlobTable(std::move(rules)).typeForName(name));
}

TEST(GlobTable, ANameWithoutAPatternHasNoType) {
  EXPECT_EQ(typeOf({{50, "a/x", "*.x", false}}, "name.y"), "");
  EXPECT_EQ(typeOf({}, "name.y"), "");
  EXPECT_EQ(typeOf({{50, "a/x", "*.x", false}}, ""), "");
}

TEST(GlobTable, AGreaterWeightWinsOverALongerPattern) {
  EXPECT_EQ(typeOf({{50, "a/long", "*.tar.gz", false}, {60, "a/heavy", "*.gz", false}}, "x.tar.gz"),
            "a/heavy");
}

TEST(GlobTable, OfEqualWeightsTheLongestPatternWins) {
  EXPECT_EQ(typeOf({{50, "a/gz", "*.gz", false}, {50, "a/targz", "*.tar.gz", false}}, "x.tar.gz"),
            "a/targz");
  EXPECT_EQ(typeOf({{50, "a/gz", "*.gz", false}, {50, "a/targz", "*.tar.gz", false}}, "x.y.gz"),
            "a/gz");
}

TEST(GlobTable, ALiteralIsBeforeASuffixAndThatBeforeAnyOther) {
  EXPECT_EQ(typeOf({{50, "a/glob", "?bc", false},
                    {50, "a/suffix", "*bc", false},
                    {50, "a/literal", "abc", false}},
                   "abc"),
            "a/literal");
  EXPECT_EQ(typeOf({{50, "a/glob", "?bc", false}, {50, "a/suffix", "*bc", false}}, "abc"),
            "a/suffix");
}

TEST(GlobTable, PatternsMatchInEitherCaseUnlessTheySayOtherwise) {
  const std::vector<GlobRule> rules = {{50, "a/cpp", "*.C", true}, {50, "a/c", "*.c", false}};
  EXPECT_EQ(typeOf(rules, "main.C"), "a/cpp");
  EXPECT_EQ(typeOf(rules, "main.c"), "a/c");
  EXPECT_EQ(typeOf({{50, "a/pdf", "*.PDF", false}}, "X.pDf"), "a/pdf");
  EXPECT_EQ(typeOf({{50, "a/core", "core", true}}, "Core"), "");
}

TEST(GlobTable, OfEqualPatternsTheMoreImportantRuleWins) {
  EXPECT_EQ(typeOf({{50, "a/first", "*.x", false}, {50, "a/second", "*.x", false}}, "n.x"),
            "a/first");
  EXPECT_EQ(typeOf({{50, "a/first", "*.x", false}, {70, "a/second", "*.x", false}}, "n.x"),
            "a/second");
}

TEST(GlobTable, SuffixesNeedNoDot) {
  EXPECT_EQ(typeOf({{50, "a/trash", "*~", false}, {10, "a/txt", "*.txt", false}}, "n.txt~"),
            "a/trash");
}

TEST(GlobTable, ANameLongerThanAnyFilesIsJudgedByItsEnd) {
  std::string name(5000, 'n');
  name += ".X";
  EXPECT_EQ(typeOf({{50, "a/x", "*.x", false}}, name), "a/x");
}

TEST(GlobTable, NamesThatAreNoUTF8HaveTypesToo) {
  EXPECT_EQ(typeOf({{50, "a/x", "*.x", false}}, "\xff\xfe.x"), "a/x");
}

}  // namespace
}  // namespace vantrell::linuxos
