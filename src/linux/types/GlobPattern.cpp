#include "linux/types/GlobPattern.h"

#include <cstddef>

namespace vantrell::linuxos {
namespace {

// The length of the set at the front of `pattern`, brackets included; 0 when there is none.
std::size_t setLength(std::string_view pattern) {
  std::size_t i = 1;
  if (i < pattern.size() && (pattern[i] == '!' || pattern[i] == '^')) ++i;
  const std::size_t close = pattern.find(']', i + 1);  // a "]" that comes first is a member
  return close == std::string_view::npos ? 0 : close + 1;
}

bool setHolds(std::string_view set, char c) {
  std::string_view members = set.substr(1, set.size() - 2);
  const bool negated = members.front() == '!' || members.front() == '^';
  if (negated) members.remove_prefix(1);
  const auto byte = static_cast<unsigned char>(c);
  for (std::size_t i = 0; i < members.size(); ++i) {
    const auto low = static_cast<unsigned char>(members[i]);
    auto high = low;
    if (i + 2 < members.size() && members[i + 1] == '-') {
      high = static_cast<unsigned char>(members[i + 2]);
      i += 2;
    }
    if (low <= byte && byte <= high) return !negated;
  }
  return negated;
}

// How many bytes of `pattern` match the single byte `c`; 0 when its front does not.
std::size_t matchOne(std::string_view pattern, char c) {
  if (pattern.empty() || pattern.front() == '*') return 0;
  if (pattern.front() == '?') return 1;
  if (pattern.front() == '[') {
    const std::size_t length = setLength(pattern);
    if (length != 0) return setHolds(pattern.substr(0, length), c) ? length : 0;
  }
  return pattern.front() == c ? 1 : 0;
}

}  // namespace

bool matchesGlob(std::string_view pattern, std::string_view text) {
  // Only the last star is ever tried again: what earlier ones took can stay as short as it is.
  std::string_view afterStar;
  std::string_view retryText;
  bool hasStar = false;
  while (!text.empty()) {
    if (const std::size_t used = matchOne(pattern, text.front())) {
      pattern.remove_prefix(used);
      text.remove_prefix(1);
    } else if (pattern.starts_with('*')) {
      pattern.remove_prefix(1);
      afterStar = pattern;
      retryText = text;
      hasStar = true;
    } else if (hasStar) {
      retryText.remove_prefix(1);
      pattern = afterStar;
      text = retryText;
    } else {
      return false;
    }
  }
  return pattern.find_first_not_of('*') == std::string_view::npos;
}

}  // namespace vantrell::linuxos
