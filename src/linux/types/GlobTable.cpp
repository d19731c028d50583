#include "linux/types/GlobTable.h"

#include <algorithm>
#include <array>
#include <tuple>

#include "linux/types/GlobPattern.h"

namespace vantrell::linuxos {
namespace {

constexpr std::string_view kWildcards = "*?[";
constexpr std::size_t kLongestName = 255;

char lowerCase(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

}  // namespace

std::string lowerCase(std::string_view text) {
  std::string lower(text);
  for (char& c : lower) c = lowerCase(c);
  return lower;
}

GlobTable::GlobTable(std::vector<GlobRule> rules) {
  for (GlobRule& rule : rules) {
    // Most names are asked about in one case or the other, so that nearly every pattern needs
    // to be kept once.
    if (!rule.isCaseSensitive) rule.pattern = lowerCase(std::string_view(rule.pattern));
    (rule.isCaseSensitive ? _exact : _anyCase).add(rule);
  }
}

void GlobTable::Patterns::add(const GlobRule& rule) {
  const std::string_view pattern = rule.pattern;
  Candidate candidate{rule.weight, pattern.size(), 2, rule.type};
  const auto keepBetter = [&candidate](Candidate& kept) {
    if (candidate.weight > kept.weight) kept = candidate;  // of equals, the earlier one stays
  };
  if (pattern.find_first_of(kWildcards) == std::string_view::npos) {
    candidate.wildcards = 0;
    const auto [kept, isNew] = literals.try_emplace(rule.pattern, candidate);
    if (!isNew) keepBetter(kept->second);
  } else if (pattern.starts_with('*') &&
             pattern.find_first_of(kWildcards, 1) == std::string_view::npos) {
    candidate.wildcards = 1;
    const std::string_view suffix = pattern.substr(1);
    if (suffix.starts_with('.')) {
      const auto [kept, isNew] = dotSuffixes.try_emplace(std::string(suffix), candidate);
      if (!isNew) keepBetter(kept->second);
    } else {
      otherSuffixes.push_back({std::string(suffix), std::move(candidate)});
    }
  } else {
    globs.push_back({rule.pattern, std::move(candidate)});
  }
}

void GlobTable::Patterns::match(std::string_view name, const Candidate*& best) const {
  const auto offer = [&best](const Candidate& candidate) {
    const auto rank = [](const Candidate& c) {
      return std::tuple(c.weight, c.length, -c.wildcards);
    };
    if (best == nullptr || rank(candidate) > rank(*best)) best = &candidate;
  };
  if (const auto found = literals.find(name); found != literals.end()) offer(found->second);
  if (!dotSuffixes.empty()) {
    for (std::size_t dot = name.find('.'); dot != std::string_view::npos;
         dot = name.find('.', dot + 1)) {
      const auto found = dotSuffixes.find(name.substr(dot));
      if (found != dotSuffixes.end()) offer(found->second);
    }
  }
  for (const Glob& glob : otherSuffixes) {
    if (name.ends_with(glob.pattern)) offer(glob.candidate);
  }
  for (const Glob& glob : globs) {
    if (matchesGlob(glob.pattern, name)) offer(glob.candidate);
  }
}

std::string_view GlobTable::typeForName(std::string_view name) const {
  const Candidate* best = nullptr;
  _exact.match(name, best);
  // A name longer than any file's is judged by its end, where suffixes are.
  const std::string_view end = name.substr(name.size() - std::min(name.size(), kLongestName));
  std::array<char, kLongestName> lower;
  std::transform(end.begin(), end.end(), lower.begin(), [](char c) { return lowerCase(c); });
  _anyCase.match(std::string_view(lower.data(), end.size()), best);
  return best == nullptr ? std::string_view() : std::string_view(best->type);
}

}  // namespace vantrell::linuxos
