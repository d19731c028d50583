#pragma once

#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace vantrell::linuxos {

/// Where this user's files of each kind go, by the XDG rules for base folders and user folders.
/// Environment variables that are not absolute paths count as unset, as those rules say.
///
/// Threads: a value; share it as you would a string.
class XdgFolders {
 public:
  /// The value of an environment variable; none when it is not set.
  using Environment = std::function<std::optional<std::string>(const char* name)>;

  /// From the variables of this process; without HOME, the home folder of the user database.
  static XdgFolders ofThisProcess();
  XdgFolders(const Environment& environment, std::string homeWithoutVariable);

  const std::string& home() const { return _home; }
  /// State that outlives a restart: $XDG_STATE_HOME, else ~/.local/state.
  const std::string& stateHome() const { return _stateHome; }
  /// $XDG_CONFIG_HOME, else ~/.config.
  const std::string& configHome() const { return _configHome; }
  /// $XDG_DATA_HOME and $XDG_DATA_DIRS, the most important first.
  const std::vector<std::string>& dataFolders() const { return _dataFolders; }

  /// The user's documents folder as user-dirs.dirs names it, else ~/Documents. None when the
  /// user has switched it off by naming the home folder. It may not exist.
  std::optional<std::string> documentsFolder() const;

 private:
  std::string _home;
  std::string _stateHome;
  std::string _configHome;
  std::vector<std::string> _dataFolders;
};

/// What XDG_DOCUMENTS_DIR says in the text of a user-dirs.dirs file; the last such line counts.
/// None without one. Lines that are not understood are passed over.
std::optional<std::string> documentsFolderInUserDirs(std::string_view text,
                                                     const std::string& home);

}  // namespace vantrell::linuxos
