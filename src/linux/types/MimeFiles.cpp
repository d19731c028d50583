#include "linux/types/MimeFiles.h"

#include <algorithm>
#include <charconv>
#include <fstream>
#include <optional>
#include <unordered_set>
#include <utility>

namespace vantrell::linuxos {
namespace {

constexpr std::size_t kLongestLine = 4096;
constexpr std::size_t kLongestPattern = 255;
constexpr std::string_view kNoGlobs = "__NOGLOBS__";

// The text up to `separator`, which is taken off `rest` with it; all of it when there is none.
std::string_view takeField(std::string_view& rest, char separator) {
  const std::size_t end = std::min(rest.find(separator), rest.size());
  const std::string_view field = rest.substr(0, end);
  rest.remove_prefix(std::min(end + 1, rest.size()));
  return field;
}

std::optional<GlobRule> parseGlob(std::string_view line) {
  GlobRule rule;
  const std::string_view weight = takeField(line, ':');
  const auto parsed = std::from_chars(weight.data(), weight.data() + weight.size(), rule.weight);
  if (parsed.ec != std::errc() || parsed.ptr != weight.data() + weight.size()) return std::nullopt;
  rule.type = takeField(line, ':');
  rule.pattern = takeField(line, ':');
  if (!isTypeName(rule.type) || rule.pattern.empty()) return std::nullopt;
  if (rule.pattern.size() > kLongestPattern) return std::nullopt;
  while (!line.empty()) {
    if (takeField(line, ',') == "cs") rule.isCaseSensitive = true;
  }
  return rule;
}

// "alias type" and "type supertype" are laid out alike.
std::optional<std::pair<std::string, std::string>> parsePair(std::string_view line) {
  const std::string_view first = takeField(line, ' ');
  if (!isTypeName(first) || !isTypeName(line)) return std::nullopt;
  return std::pair(std::string(first), std::string(line));
}

class Reader {
 public:
  // Folders come in the order of their importance.
  void readFolder(const std::string& folder) {
    std::unordered_set<std::string> hiddenByThis;
    forEachLine(folder + "/globs2", [&](std::string_view line) {
      auto rule = parseGlob(line);
      if (!rule) return;
      if (rule->pattern == kNoGlobs) {
        hiddenByThis.insert(rule->type);
      } else if (!_hidden.contains(rule->type)) {
        _database.globs.push_back(*std::move(rule));
      }
    });
    _hidden.merge(hiddenByThis);
    forEachLine(folder + "/aliases", [this](std::string_view line) {
      if (auto pair = parsePair(line)) _database.aliases.insert(*std::move(pair));
    });
    forEachLine(folder + "/subclasses", [this](std::string_view line) {
      auto pair = parsePair(line);
      if (pair) _database.supertypes[pair->first].push_back(std::move(pair->second));
    });
  }

  MimeDatabase take() { return std::move(_database); }

 private:
  MimeDatabase _database;
  std::unordered_set<std::string> _hidden;  // types of which later folders' patterns do not count
};

}  // namespace

MimeDatabase readMimeDatabase(const std::vector<std::string>& mimeFolders) {
  Reader reader;
  for (const std::string& folder : mimeFolders) reader.readFolder(folder);
  return reader.take();
}

void forEachLine(const std::string& path, const std::function<void(std::string_view)>& each) {
  std::ifstream file(path, std::ios::binary);
  std::string line;
  while (std::getline(file, line)) {
    if (line.ends_with('\r')) line.pop_back();
    if (line.size() <= kLongestLine && !line.starts_with('#')) each(line);
  }
}

bool isTypeName(std::string_view type) {
  const auto isTypeCharacter = [](char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
           std::string_view("!#$&-^_.+").find(c) != std::string_view::npos;
  };
  const std::size_t slash = type.find('/');
  if (slash == 0 || slash == std::string_view::npos || slash + 1 == type.size()) return false;
  const std::string_view kind = type.substr(0, slash);
  const std::string_view name = type.substr(slash + 1);
  // Types become file names: "../.." is none.
  return !kind.starts_with('.') && !name.starts_with('.') &&
         std::all_of(kind.begin(), kind.end(), isTypeCharacter) &&
         std::all_of(name.begin(), name.end(), isTypeCharacter);
}

}  // namespace vantrell::linuxos
