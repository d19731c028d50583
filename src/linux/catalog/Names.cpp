#include "linux/catalog/Names.h"

#include <algorithm>
#include <array>

namespace vantrell::linuxos::catalog {

namespace {

constexpr std::array<std::string_view, 6> kSetAsideSuffixes = {".bak", ".orig", ".old",
                                                               ".tmp", ".temp", ".sav"};

char lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

bool endsInAnyCase(std::string_view name, std::string_view suffix) {
  return name.size() >= suffix.size() &&
         std::equal(suffix.begin(), suffix.end(), name.end() - static_cast<long>(suffix.size()),
                    [](char wanted, char given) { return wanted == lower(given); });
}

}  // namespace

bool isSetAsideName(std::string_view name) {
  if (name.empty()) return false;
  if (isHiddenName(name) || name.starts_with('~') || name.ends_with('~')) return true;
  if (name.size() > 1 && name.starts_with('#') && name.ends_with('#')) return true;
  return std::ranges::any_of(kSetAsideSuffixes,
                             [&](std::string_view suffix) { return endsInAnyCase(name, suffix); });
}

}  // namespace vantrell::linuxos::catalog
