#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>

#include "linux/catalog/CatalogTestStorage.h"

namespace vantrell::linuxos {
namespace {

namespace fs = std::filesystem;

class Look : public CatalogTest {};

TEST_F(Look, TheFirstLookCataloguesEverythingInView) {
  makeFolder("folder/inner");
  write("folder/a");
  write("folder/inner/b");
  const LookReport report = look();
  EXPECT_EQ(report.entriesSeen, 4U);
  EXPECT_EQ(report.created, 4U);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("")), 1U);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("folder")), 2U);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("folder/a")), std::nullopt);
  EXPECT_EQ(*catalog().pathForFileID(fileID("folder/inner/b")), path("folder/inner/b"));
  EXPECT_EQ(*catalog().pathForFileID(fileID("")), path(""));
}

TEST_F(Look, ALookAtNothingNewFindsNoDifferences) {
  makeFolder("folder");
  write("folder/a");
  look();
  letTimePass();
  look();
  const LookReport report = lookAfterRestart();
  EXPECT_EQ(report.entriesSeen, 2U);
  EXPECT_EQ(report.created + report.gone + report.moved + report.changed + report.replaced, 0U);
}

TEST_F(Look, TheReportTellsDifferencesApart) {
  makeFolder("folder");
  for (const char* name : {"changed", "gone", "moved", "replaced"}) write(name);
  look();
  close();
  write("changed", "longer than before");
  remove("gone");
  rename("moved", "folder/moved");
  write("new");
  rename("new", "replaced");
  write("created");
  const LookReport report = look();
  EXPECT_EQ(report.created, 1U);
  EXPECT_EQ(report.gone, 1U);
  EXPECT_EQ(report.moved, 1U);
  EXPECT_EQ(report.replaced, 1U);
  EXPECT_EQ(report.changed, 2U);  // the folder's own stamps change with what is in it
}

TEST_F(Look, HiddenNamesAndWhatLiesBelowThemAreNotCatalogued) {
  makeFolder(".hidden/folder");
  write(".hidden/folder/a");
  write(".b");
  EXPECT_EQ(look().entriesSeen, 0U);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("")), 0U);
}

TEST_F(Look, TheTrashOfARootAndOfADocumentsFolderIsCatalogued) {
  for (const char* folder : {".Trash", "Documents/.Trash", "Other/.Trash"}) {
    makeFolder(folder);
    write(std::string(folder) + "/a");
  }
  write("Documents/.Trash/.hidden");
  look();
  EXPECT_EQ(catalog().entryCountOfFolder(fileID(".Trash")), 1U);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("Documents/.Trash")), 1U);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("Other/.Trash")), std::nullopt);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("Documents")), 1U);
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("Other")), 0U);
}

TEST_F(Look, AFileCalledTrashIsHiddenLikeAnyOther) {
  write(".Trash");
  EXPECT_EQ(look().entriesSeen, 0U);
}

TEST_F(Look, ADocumentMovedToTheTrashAndBackKeepsItsID) {
  makeFolder("Documents/.Trash");
  write("Documents/a");
  look();
  const DocumentID a = idOf("Documents/a");
  close();
  rename("Documents/a", "Documents/.Trash/a");
  look();
  EXPECT_EQ(placeOf(a), "Documents/.Trash/a");
  close();
  rename("Documents/.Trash/a", "Documents/b");
  look();
  EXPECT_EQ(placeOf(a), "Documents/b");
}

TEST_F(Look, AFolderTooLargeToBeHeldIsComparedInPieces) {
  constexpr int kFiles = 20'000;
  for (int i = 0; i < kFiles; ++i) {
    const int file = ::open(path("f" + std::to_string(i)).c_str(), O_CREAT | O_WRONLY, 0600);
    ::close(file);
  }
  EXPECT_EQ(look().created, static_cast<std::uint64_t>(kFiles));
  const DocumentID kept = idOf("f7");
  const DocumentID deleted = idOf("f8");
  const DocumentID moved = idOf("f9");
  close();
  remove("f8");
  rename("f9", "moved");
  write("new");
  const LookReport report = look();
  EXPECT_EQ(report.created, 1U);
  EXPECT_EQ(report.gone, 1U);
  EXPECT_EQ(report.moved, 1U);
  EXPECT_EQ(placeOf(kept), "f7");
  EXPECT_EQ(placeOf(deleted), "");
  EXPECT_EQ(placeOf(moved), "moved");
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("")), static_cast<std::uint64_t>(kFiles));
  EXPECT_EQ(idOf("f7"), kept);
  for (int i = 0; i < kFiles; ++i) ::unlink(path("f" + std::to_string(i)).c_str());
  EXPECT_EQ(lookAfterRestart().gone, static_cast<std::uint64_t>(kFiles - 2));
}

TEST_F(Look, AMissingRootKeepsWhatWasKnownOfIt) {
  write("a");
  look();
  const DocumentID a = idOf("a");
  close();
  fs::rename(path(""), outside("storage"));
  const LookReport report = look();
  EXPECT_EQ(report.unreadableFolders, std::vector<std::string>{path("")});
  EXPECT_EQ(report.documentsGone, 0U);
  EXPECT_FALSE(errorLines().empty());
  close();
  fs::rename(outside("storage"), path(""));
  look();
  EXPECT_EQ(placeOf(a), "a");
}

TEST_F(Look, ARootThatIsNoLongerOneTakesItsDocumentsAlongUntilItIsOneAgain) {
  roots.push_back(folder() + "/outside");
  std::filesystem::create_directory(outside("app"));
  write("a");
  look();
  fs::rename(path("a"), outside("a"));
  look();
  const FileID number = [&] {
    struct stat status {};
    ::stat(outside("a").c_str(), &status);
    return FileID{status.st_ino};
  }();
  EXPECT_EQ(*catalog().pathForFileID(number), outside("a"));
  close();
  roots.pop_back();
  look();
  EXPECT_TRUE(catalog().pathForFileID(number).error().isPosix(ENOENT));
  close();
  roots.push_back(folder() + "/outside");
  look();
  EXPECT_EQ(*catalog().pathForFileID(number), outside("a"));
}

TEST_F(Look, ARootInsideAnotherIsLookedAtOnce) {
  makeFolder("library");
  write("library/a");
  roots.push_back(path("library"));
  EXPECT_EQ(look().entriesSeen, 2U);
  EXPECT_EQ(*catalog().pathForFileID(fileID("library/a")), path("library/a"));
}

TEST_F(Look, ARootOnAnotherVolumeIsLeftOutWithAnErrorLine) {
  roots.push_back("/proc");
  write("a");
  EXPECT_EQ(look().entriesSeen, 1U);
  ASSERT_EQ(errorLines().size(), 1U);
  EXPECT_EQ(errorLines().front(),
            "\"/proc\" is left out: it lies on another volume than \"" + path("") + "\"");
}

/// The same as a user who may not read everything, whoever runs the tests.
class UnreadableFolders : public CatalogTest {
 protected:
  UnreadableFolders() { becomeOrdinaryUser(); }
  ~UnreadableFolders() override {
    for (const char* name : {"", "closed"}) ::chmod(path(name).c_str(), 0700);
  }

  void allow(std::string_view name, mode_t mode) {
    ASSERT_EQ(::chmod(path(name).c_str(), mode), 0);
  }
};

TEST_F(UnreadableFolders, KeepWhatIsKnownOfThemAndAreReported) {
  makeFolder("closed/inner");
  write("closed/inner/a");
  look();
  const DocumentID a = idOf("closed/inner/a");
  for (const mode_t mode : {mode_t{0}, mode_t{0400}, mode_t{0100}}) {
    close();
    allow("closed", mode);
    const LookReport report = look();
    EXPECT_EQ(report.unreadableFolderCount, 1U) << mode;
    EXPECT_EQ(report.unreadableFolders, std::vector<std::string>{path("closed")}) << mode;
    EXPECT_EQ(report.documentsGone, 0U) << mode;
    EXPECT_EQ(catalog().statistics()->unreadableFolders, 1U);
    ASSERT_FALSE(errorLines().empty());
    EXPECT_EQ(errorLines().back(),
              "can't read the folder \"" + path("closed") +
                  "\", what was known of it is kept; EACCES: Permission denied");
  }
  close();
  allow("closed", 0700);
  EXPECT_EQ(look().unreadableFolderCount, 0U);
  EXPECT_EQ(placeOf(a), "closed/inner/a");
}

TEST_F(UnreadableFolders, AnUnreadableRootKeepsWhatIsKnown) {
  write("a");
  look();
  const DocumentID a = idOf("a");
  close();
  allow("", 0);
  EXPECT_EQ(look().unreadableFolders, std::vector<std::string>{path("")});
  close();
  allow("", 0700);
  look();
  EXPECT_EQ(placeOf(a), "a");
}

TEST_F(UnreadableFolders, AFolderMovedOutOfOneIsAtItsNewPlaceOnly) {
  makeFolder("closed/inner");
  write("closed/inner/a");
  look();
  const DocumentID a = idOf("closed/inner/a");
  close();
  rename("closed/inner", "inner");
  allow("closed", 0300);
  look();
  EXPECT_EQ(placeOf(a), "inner/a");
}

TEST_F(UnreadableFolders, AttributesThatCannotBeSetNowAreSetAtALaterLook) {
  write("a");
  look();
  const DocumentID a = idOf("a");
  setAttribute("a", "user.com.quillon.lastuseddate#PS", "date");
  look();
  close();
  write("new");
  rename("new", "a");
  allow("a", 0400);
  look();
  EXPECT_EQ(idOf("a"), a);
  EXPECT_EQ(attribute("a", "user.com.quillon.lastuseddate#PS"), "none");
  close();
  allow("a", 0600);
  look();
  EXPECT_EQ(attribute("a", "user.com.quillon.lastuseddate#PS"), "date");
}

}  // namespace
}  // namespace vantrell::linuxos
