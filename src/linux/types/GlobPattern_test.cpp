#include "linux/types/GlobPattern.h"

#include <gtest/gtest.h>

#include <string>

namespace vantrell::linuxos {
namespace {

struct GlobCase {
  const char* pattern;
  const char* text;
  bool matches;
};

TEST(GlobPattern, MatchesAsTheTableSays) {
  constexpr GlobCase kCases[] = {
      {"", "", true},
      {"", "a", false},
      {"a", "a", true},
      {"a", "", false},
      {"*", "", true},
      {"*", "anything", true},
      {"a*c", "abbbc", true},
      {"a*c", "ac", true},
      {"a*c", "acb", false},
      {"*.so.[0-9]*", "lib.so.6", true},
      {"*.so.[0-9]*", "lib.so.6.1", true},
      {"*.so.[0-9]*", "lib.so.x", false},
      {"*.anim[1-9j]", "x.animj", true},
      {"*.anim[1-9j]", "x.anim0", false},
      {"[!a]b", "cb", true},
      {"[!a]b", "ab", false},
      {"[^a]b", "ab", false},
      {"[]]", "]", true},
      {"[a-]", "-", true},
      {"[a", "[a", true},
      {"[", "[", true},
      {"[!", "[!", true},
      {"?", "", false},
      {"?", "\xff", true},
      {"a?c", "abc", true},
      {"*a*b*c", "xaxbxc", true},
      {"*a*b*c", "xaxbx", false},
      {"**", "", true},
  };
  for (const GlobCase& c : kCases) {
    EXPECT_EQ(matchesGlob(c.pattern, c.text), c.matches) << c.pattern << " on " << c.text;
  }
}

TEST(GlobPattern, ManyStarsTakeNoExponentialTime) {
  std::string pattern;
  for (int i = 0; i < 100; ++i) pattern += "*a";
  EXPECT_FALSE(matchesGlob(pattern + "b", std::string(250, 'a')));
}

}  // namespace
}  // namespace vantrell::linuxos
