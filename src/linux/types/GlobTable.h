#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "linux/types/StringMap.h"

namespace vantrell::linuxos {

/// One line of a "globs2" file.
struct GlobRule {
  int weight = 50;
  std::string type;
  std::string pattern;
  bool isCaseSensitive = false;
};

/// Which type a name has by its pattern: of all patterns that match, the one with the greatest
/// weight, then the longest, then the one that holds the fewest wildcards (a literal, a suffix,
/// any other), then the more important rule.
///
/// Threads: immutable once it is made.
class GlobTable {
 public:
  /// `rules` come with the most important first.
  explicit GlobTable(std::vector<GlobRule> rules);

  /// The type of `name`; empty when no pattern matches. The view lives as long as the table.
  std::string_view typeForName(std::string_view name) const;

 private:
  struct Candidate {
    int weight = 0;
    std::size_t length = 0;  // of the whole pattern, in bytes
    int wildcards = 0;       // 0: a literal, 1: a suffix, 2: any other
    std::string type;
  };
  struct Glob {
    std::string pattern;
    Candidate candidate;
  };
  // What is compared with the name as it is, or with the name in lower case.
  struct Patterns {
    StringMap<Candidate> literals;
    StringMap<Candidate> dotSuffixes;
    std::vector<Glob> otherSuffixes;  // "*~": too few to be worth a table
    std::vector<Glob> globs;

    void add(const GlobRule& rule);
    void match(std::string_view name, const Candidate*& best) const;
  };

  Patterns _exact;
  Patterns _anyCase;  // patterns in lower case
};

/// ASCII letters in lower case; other bytes stay.
std::string lowerCase(std::string_view text);

}  // namespace vantrell::linuxos
