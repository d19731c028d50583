#include "linux/system/XdgFolders.h"

#include <pwd.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <fstream>
#include <iterator>

namespace vantrell::linuxos {
namespace {

constexpr std::string_view kHomeVariable = "$HOME";

std::string withoutTrailingSlashes(std::string path) {
  while (path.size() > 1 && path.ends_with('/')) path.pop_back();
  return path;
}

std::optional<std::string> absolutePath(std::optional<std::string> value) {
  if (!value || !value->starts_with('/')) return std::nullopt;
  return withoutTrailingSlashes(*std::move(value));
}

std::string homeFromUserDatabase() {
  std::array<char, 16384> buffer;
  passwd entry;
  passwd* found = nullptr;
  if (::getpwuid_r(::geteuid(), &entry, buffer.data(), buffer.size(), &found) != 0 ||
      found == nullptr) {
    return "/";
  }
  return found->pw_dir;
}

std::vector<std::string> absolutePathsInList(std::string_view list) {
  std::vector<std::string> paths;
  while (!list.empty()) {
    const std::size_t colon = std::min(list.find(':'), list.size());
    if (auto path = absolutePath(std::string(list.substr(0, colon)))) {
      paths.push_back(*std::move(path));
    }
    list.remove_prefix(std::min(colon + 1, list.size()));
  }
  return paths;
}

std::string_view withoutLeadingBlanks(std::string_view text) {
  text.remove_prefix(std::min(text.find_first_not_of(" \t"), text.size()));
  return text;
}

// Takes `word` away from the front of `text`, and the blanks after it; false when it is not there.
bool take(std::string_view& text, std::string_view word) {
  if (!text.starts_with(word)) return false;
  text = withoutLeadingBlanks(text.substr(word.size()));
  return true;
}

// The text up to the closing quote, without the shell's backslashes. None when nothing closes it.
std::optional<std::string> quotedText(std::string_view text) {
  std::string value;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '"') return value;
    if (text[i] == '\\' && i + 1 < text.size()) ++i;
    value += text[i];
  }
  return std::nullopt;
}

std::optional<std::string> documentsFolderInLine(std::string_view line, const std::string& home) {
  line = withoutLeadingBlanks(line);
  if (!take(line, "XDG_DOCUMENTS_DIR") || !take(line, "=") || !line.starts_with('"')) {
    return std::nullopt;
  }
  line.remove_prefix(1);
  const bool belowHome = line.starts_with(kHomeVariable);
  if (belowHome) line.remove_prefix(kHomeVariable.size());
  const auto value = quotedText(line);
  if (!value) return std::nullopt;
  if (belowHome && (value->empty() || value->front() == '/')) {
    return withoutTrailingSlashes(home + *value);
  }
  return belowHome ? std::nullopt : absolutePath(value);
}

}  // namespace

XdgFolders XdgFolders::ofThisProcess() {
  const auto environment = [](const char* name) -> std::optional<std::string> {
    const char* value = std::getenv(name);
    return value == nullptr ? std::nullopt : std::optional<std::string>(value);
  };
  return XdgFolders(environment, homeFromUserDatabase());
}

XdgFolders::XdgFolders(const Environment& environment, std::string homeWithoutVariable) {
  _home = absolutePath(environment("HOME"))
              .value_or(withoutTrailingSlashes(std::move(homeWithoutVariable)));
  const std::string base = _home == "/" ? "" : _home;
  _stateHome = absolutePath(environment("XDG_STATE_HOME")).value_or(base + "/.local/state");
  _configHome = absolutePath(environment("XDG_CONFIG_HOME")).value_or(base + "/.config");
  _dataFolders.push_back(
      absolutePath(environment("XDG_DATA_HOME")).value_or(base + "/.local/share"));
  const auto systemFolders = environment("XDG_DATA_DIRS");
  const bool given = systemFolders && !systemFolders->empty();
  const auto paths = absolutePathsInList(given ? *systemFolders : "/usr/local/share:/usr/share");
  _dataFolders.insert(_dataFolders.end(), paths.begin(), paths.end());
}

std::optional<std::string> XdgFolders::documentsFolder() const {
  std::ifstream file(_configHome + "/user-dirs.dirs", std::ios::binary);
  const std::string text{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  const auto named = documentsFolderInUserDirs(text, _home);
  if (!named) return (_home == "/" ? "" : _home) + "/Documents";
  if (*named == _home) return std::nullopt;
  return named;
}

std::optional<std::string> documentsFolderInUserDirs(std::string_view text,
                                                     const std::string& home) {
  std::optional<std::string> folder;
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    if (auto named = documentsFolderInLine(text.substr(0, end), home)) folder = std::move(named);
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return folder;
}

}  // namespace vantrell::linuxos
