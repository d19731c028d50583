#include <algorithm>
#include <array>

#include "tests/contracts/ContractTest.h"

namespace vantrell::testing {
namespace {

using Key = FndURLResourceKey;

class FolderContract : public ContractTest {
 protected:
  Result<std::unique_ptr<DirectoryEnumerator>> enumerate(const std::string& path,
                                                         std::uint8_t options) {
    const std::array keys = {Key::ParentDirectoryURL, Key::Name, Key::TypeIdentifier};
    return system().fileSystem().enumerateDirectory(
        url(path), keys, options, [this](const FndURL& at, const FndError& error) {
          _errors.emplace_back(at.path().substr(system().root().size()), error);
          return _continues;
        });
  }
  std::vector<FndURL> list(const std::string& path, std::uint8_t options) {
    auto entries = enumerate(path, options);
    if (!entries) throw std::runtime_error(entries.error().description());
    std::vector<FndURL> listed;
    while (auto entry = (*entries)->next()) listed.push_back(*std::move(entry));
    return listed;
  }
  std::vector<std::string> paths(const std::string& path, std::uint8_t options) {
    std::vector<std::string> all;
    for (const FndURL& entry : list(path, options)) {
      all.push_back(entry.path().substr(system().root().size()));
    }
    return all;
  }
  std::vector<std::string> sortedPaths(const std::string& path, std::uint8_t options) {
    std::vector<std::string> all = paths(path, options);
    std::sort(all.begin(), all.end());
    return all;
  }
  const std::vector<std::pair<std::string, FndError>>& errors() const { return _errors; }
  void stopAtErrors() { _continues = false; }

 private:
  std::vector<std::pair<std::string, FndError>> _errors;
  bool _continues = true;
};

TEST_P(FolderContract, AnEmptyFolderListsNothing) {
  EXPECT_TRUE(list("", 0).empty());
  EXPECT_TRUE(errors().empty());
}

TEST_P(FolderContract, WhereNothingIsThereIsNoSuchFile) {
  EXPECT_TRUE(isNoSuchFile(enumerate("/none", 0).error()));
  system().writeFile("/file", "");
  EXPECT_TRUE(isNoSuchFile(enumerate("/file/none", 0).error()));
}

TEST_P(FolderContract, AFileIsNoFolder) {
  system().writeFile("/file", "");
  EXPECT_TRUE(enumerate("/file", 0).error().isPosix(ENOTDIR));
}

TEST_P(FolderContract, AnUnreadableFolderIsEACCES) {
  system().makeFolder("/closed");
  system().setMode("/closed", 0000);
  EXPECT_TRUE(enumerate("/closed", 0).error().isPosix(EACCES));
  system().setMode("/closed", 0700);
}

TEST_P(FolderContract, AnEntryComesBeforeWhatLiesBelowIt) {
  system().makeFolder("/a");
  system().makeFolder("/a/b");
  system().writeFile("/a/b/c", "");
  EXPECT_EQ(paths("", 0), (std::vector<std::string>{"/a", "/a/b", "/a/b/c"}));
}

TEST_P(FolderContract, OptionsLeaveOutWhatTheySay) {
  system().makeFolder("/sub");
  system().writeFile("/sub/file", "");
  system().makeFolder("/whole.pouch");
  system().writeFile("/whole.pouch/inside", "");
  system().makeFolder("/.hidden");
  system().writeFile("/.hidden/file", "");
  using Paths = std::vector<std::string>;
  EXPECT_EQ(sortedPaths("", 0), (Paths{"/.hidden", "/.hidden/file", "/sub", "/sub/file",
                                       "/whole.pouch", "/whole.pouch/inside"}));
  EXPECT_EQ(sortedPaths("", kSkipsSubdirectoryDescendants),
            (Paths{"/.hidden", "/sub", "/whole.pouch"}));
  EXPECT_EQ(sortedPaths("", kSkipsPackageDescendants | kSkipsHiddenFiles),
            (Paths{"/sub", "/sub/file", "/whole.pouch"}));
  EXPECT_EQ(sortedPaths("", kSkipsHiddenFiles),
            (Paths{"/sub", "/sub/file", "/whole.pouch", "/whole.pouch/inside"}));
}

TEST_P(FolderContract, LinksAreListedAndNotFollowed) {
  system().makeFolder("/sub");
  system().makeLink("/sub/up", system().root());
  EXPECT_EQ(paths("", 0), (std::vector<std::string>{"/sub", "/sub/up"}));
}

TEST_P(FolderContract, TheOrderIsTheSameWhenNothingHasChanged) {
  for (int i = 0; i < 300; ++i) system().writeFile("/file " + std::to_string(i), "");
  const auto first = paths("", 0);
  EXPECT_EQ(first.size(), 300U);
  EXPECT_EQ(paths("", 0), first);
}

TEST_P(FolderContract, EntriesRememberThePrefetchedValues) {
  system().makeFolder("/sub");
  system().writeFile("/sub/note.txt", "");
  const FndURL entry = list("/sub", 0).at(0);
  system().remove("/sub/note.txt");
  EXPECT_EQ(std::get<FndURL>(*entry.cachedResourceValue(Key::ParentDirectoryURL)), url("/sub"));
  EXPECT_EQ(std::get<std::string>(*entry.cachedResourceValue(Key::Name)), "note.txt");
  EXPECT_EQ(std::get<std::string>(*entry.cachedResourceValue(Key::TypeIdentifier)), "text/plain");
}

TEST_P(FolderContract, AnUnreadableFolderBelowGoesToTheErrorHandlerAndTheListingGoesOn) {
  system().makeFolder("/closed");
  system().writeFile("/file", "");
  system().setMode("/closed", 0000);
  EXPECT_EQ(sortedPaths("", 0), (std::vector<std::string>{"/closed", "/file"}));
  ASSERT_EQ(errors().size(), 1U);
  EXPECT_EQ(errors()[0].first, "/closed");
  EXPECT_TRUE(errors()[0].second.isPosix(EACCES));
  system().setMode("/closed", 0700);
}

TEST_P(FolderContract, TheErrorHandlerCanEndTheListing) {
  for (const std::string path : {"/a", "/b"}) {
    system().makeFolder(path);
    system().setMode(path, 0000);
  }
  stopAtErrors();
  EXPECT_LE(paths("", 0).size(), 2U);
  EXPECT_EQ(errors().size(), 1U);
}

TEST_P(FolderContract, AFolderIsMadeWithThoseAboveIt) {
  ASSERT_TRUE(system().fileSystem().createDirectory(url("/a/b/c")).has_value());
  EXPECT_EQ(paths("", 0), (std::vector<std::string>{"/a", "/a/b", "/a/b/c"}));
  EXPECT_TRUE(system().fileSystem().createDirectory(url("/a/b")).has_value());
}

TEST_P(FolderContract, AFolderCannotTakeAFilesPlace) {
  system().writeFile("/file", "content");
  EXPECT_TRUE(system().fileSystem().createDirectory(url("/file")).error().isPosix(EEXIST));
  EXPECT_FALSE(system().fileSystem().createDirectory(url("/file/sub")).has_value());
}

TEST_P(FolderContract, AFolderCannotBeMadeWhereTheCallerMayNotWrite) {
  system().makeFolder("/closed");
  system().setMode("/closed", 0500);
  EXPECT_TRUE(system().fileSystem().createDirectory(url("/closed/sub")).error().isPosix(EACCES));
}

TEST_P(FolderContract, TheSizeOfAFolderIsThatOfAllFilesBelowIt) {
  system().makeFolder("/a");
  system().makeFolder("/a/b.pouch");
  system().writeFile("/a/one", "1");
  system().writeFile("/a/b.pouch/three", "333");
  system().writeFile("/a/b.pouch/.hidden", "22");
  system().makeLink("/a/link", "one");
  EXPECT_EQ(*system().fileSystem().recursiveSizeOfDirectory(url("/a")), 6U);
  EXPECT_FALSE(system().fileSystem().recursiveSizeOfDirectory(url("/none")).has_value());
  EXPECT_TRUE(
      system().fileSystem().recursiveSizeOfDirectory(url("/a/one")).error().isPosix(ENOTDIR));
}

TEST_P(FolderContract, TheStatusFollowsALinkAtTheEnd) {
  system().writeFile("/file", "");
  system().makeLink("/link", "file");
  EXPECT_EQ(system().fileSystem().status(url("/link"))->fileID, fileID("/file"));
  EXPECT_NE(fileID("/link"), fileID("/file"));
  EXPECT_TRUE(system().fileSystem().status(url("/none")).error().isPosix(ENOENT));
}

TEST_P(FolderContract, AFoldersLinkCountIsTheNumberOfItsEntriesAndTwo) {
  system().makeFolder("/sub");
  system().makeFolder("/sub/folder");
  for (int i = 0; i < 4; ++i) system().writeFile("/sub/file" + std::to_string(i), "");
  system().catalogue("/sub");
  EXPECT_EQ(system().fileSystem().status(url("/sub"))->linkCount, 7U);
}

TEST_P(FolderContract, ACanonicalPlaceHasNoLinksInItsFolders) {
  system().makeFolder("/real");
  system().makeFolder("/real/sub");
  system().makeLink("/link", "real");
  system().makeLink("/real/up", "..");
  const auto canonical = [this](const std::string& path) {
    const auto found = system().fileSystem().canonicalURL(url(path));
    return found ? found->path().substr(system().root().size()) : found.error().description();
  };
  EXPECT_EQ(canonical("/link/sub"), "/real/sub");
  EXPECT_EQ(canonical("/link/up/real/../real/none"), "/real/none");
  EXPECT_EQ(canonical("/link"), "/link");
  EXPECT_EQ(canonical("/link/sub/.."), "/real");
  EXPECT_TRUE(system().fileSystem().canonicalURL(url("/none/x")).error().isPosix(ENOENT));
}

VANTRELL_CONTRACT(FolderContract);

}  // namespace
}  // namespace vantrell::testing
