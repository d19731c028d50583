#include "linux/system/XdgFolders.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <map>

namespace vantrell::linuxos {
namespace {

using testing::ElementsAre;
using Variables = std::map<std::string, std::string>;

XdgFolders foldersWith(const Variables& variables) {
  return XdgFolders(
      [&variables](const char* name) -> std::optional<std::string> {
        const auto found = variables.find(name);
        if (found == variables.end()) return std::nullopt;
        return found->second;
      },
      "/home/fallback");
}

TEST(XdgFolders, WithoutVariablesEverythingLiesBelowTheHomeOfTheUserDatabase) {
  const XdgFolders folders = foldersWith({});
  EXPECT_EQ(folders.home(), "/home/fallback");
  EXPECT_EQ(folders.stateHome(), "/home/fallback/.local/state");
  EXPECT_EQ(folders.configHome(), "/home/fallback/.config");
  EXPECT_THAT(folders.dataFolders(),
              ElementsAre("/home/fallback/.local/share", "/usr/local/share", "/usr/share"));
}

TEST(XdgFolders, VariablesMoveEveryFolder) {
  const XdgFolders folders = foldersWith({{"HOME", "/h/"},
                                          {"XDG_STATE_HOME", "/s"},
                                          {"XDG_CONFIG_HOME", "/c"},
                                          {"XDG_DATA_HOME", "/d"},
                                          {"XDG_DATA_DIRS", "/one/:/two"}});
  EXPECT_EQ(folders.home(), "/h");
  EXPECT_EQ(folders.stateHome(), "/s");
  EXPECT_EQ(folders.configHome(), "/c");
  EXPECT_THAT(folders.dataFolders(), ElementsAre("/d", "/one", "/two"));
}

TEST(XdgFolders, RelativeAndEmptyVariablesCountAsUnset) {
  const XdgFolders folders = foldersWith({{"HOME", "home"},
                                          {"XDG_STATE_HOME", "state"},
                                          {"XDG_DATA_HOME", ""},
                                          {"XDG_DATA_DIRS", "share:/two::"}});
  EXPECT_EQ(folders.home(), "/home/fallback");
  EXPECT_EQ(folders.stateHome(), "/home/fallback/.local/state");
  EXPECT_THAT(folders.dataFolders(), ElementsAre("/home/fallback/.local/share", "/two"));
}

TEST(XdgFolders, AHomeThatIsTheRootGivesNoDoubleSlash) {
  EXPECT_EQ(foldersWith({{"HOME", "/"}}).stateHome(), "/.local/state");
}

TEST(UserDirs, AFolderBelowHomeIsFound) {
  EXPECT_EQ(documentsFolderInUserDirs("XDG_DOCUMENTS_DIR=\"$HOME/Dokumente\"\n", "/h"),
            "/h/Dokumente");
}

TEST(UserDirs, AnAbsoluteFolderIsFoundAmongOtherLines) {
  EXPECT_EQ(documentsFolderInUserDirs("# made by a tool\nXDG_MUSIC_DIR=\"$HOME/Music\"\n"
                                      "  XDG_DOCUMENTS_DIR = \"/data/docs/\"",
                                      "/h"),
            "/data/docs");
}

TEST(UserDirs, BackslashesProtectWhatFollowsThem) {
  EXPECT_EQ(documentsFolderInUserDirs("XDG_DOCUMENTS_DIR=\"$HOME/a\\\"b\\\\c\\$d\"", "/h"),
            "/h/a\"b\\c$d");
}

TEST(UserDirs, TheLastLineCounts) {
  EXPECT_EQ(documentsFolderInUserDirs("XDG_DOCUMENTS_DIR=\"/a\"\nXDG_DOCUMENTS_DIR=\"/b\"\n", "/h"),
            "/b");
}

TEST(UserDirs, LinesThatAreNotUnderstoodArePassedOver) {
  for (const char* line : {"", "XDG_DOCUMENTS_DIR", "XDG_DOCUMENTS_DIR=", "XDG_DOCUMENTS_DIR=/bare",
                           "XDG_DOCUMENTS_DIR=\"relative\"", "XDG_DOCUMENTS_DIR=\"/open",
                           "XDG_DOCUMENTS_DIR=\"$HOMELAND/x\"", "#XDG_DOCUMENTS_DIR=\"/comment\"",
                           "XDG_DOCUMENTS_DIRECTORY=\"/x\""}) {
    EXPECT_EQ(documentsFolderInUserDirs(line, "/h"), std::nullopt) << line;
  }
}

class DocumentsFolder : public testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = std::filesystem::temp_directory_path() / "vantrell-xdg-XXXXXX";
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    _home = pattern;
    std::filesystem::create_directory(_home / ".config");
  }
  void TearDown() override { std::filesystem::remove_all(_home); }

  void writeUserDirs(std::string_view text) {
    std::ofstream(_home / ".config/user-dirs.dirs") << text;
  }
  std::optional<std::string> folder() {
    const Variables variables{{"HOME", _home}};
    return foldersWith(variables).documentsFolder();
  }

  std::filesystem::path _home;
};

TEST_F(DocumentsFolder, WithoutAFileItIsDocumentsBelowHome) {
  EXPECT_EQ(folder(), _home / "Documents");
}

TEST_F(DocumentsFolder, TheFileNamesIt) {
  writeUserDirs("XDG_DOCUMENTS_DIR=\"$HOME/Papiere\"\n");
  EXPECT_EQ(folder(), _home / "Papiere");
}

TEST_F(DocumentsFolder, NamingTheHomeFolderSwitchesItOff) {
  writeUserDirs("XDG_DOCUMENTS_DIR=\"$HOME/\"\n");
  EXPECT_EQ(folder(), std::nullopt);
}

}  // namespace
}  // namespace vantrell::linuxos
