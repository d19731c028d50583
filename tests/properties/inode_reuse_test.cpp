// The file system gives the number of a file that is gone to the next one. Nothing else is the
// same about them.
#include <gtest/gtest.h>

#include <memory>

#include "JudgedStorage.h"

namespace vantrell::properties {
namespace {

constexpr int kStorages = 20;
constexpr int kAttempts = 20;
constexpr const char* kDate = "com.quillon.lastuseddate#PS";

class InodeReuse : public ::testing::Test {
 protected:
  /// Plays a scenario on new storages until it got the number it wanted: where a file system
  /// puts a new folder depends on what else is going on.
  template <class Scenario>
  void untilReused(const Scenario& scenario) {
    for (int attempt = 0; attempt < kStorages; ++attempt) {
      _judged = std::make_unique<JudgedStorage>(TestStorage::defaultParent());
      const bool wasReused = scenario();
      EXPECT_EQ(_judged->complaints(), "");
      if (wasReused) return;
    }
    GTEST_SKIP() << "this file system does not give the numbers of removed files again";
  }

  /// Removes the thing and makes new ones with `make` until one has its number. False where the
  /// file system does not give numbers again.
  template <class Make>
  bool replaceKeepingNumber(const std::string& old, const std::string& name, const Make& make) {
    const FileID number = _judged->fileAt(old);
    storage().remove(path(old));
    for (int attempt = 0; attempt < kAttempts; ++attempt) {
      make(path(name));
      if (_judged->fileAt(name) == number) return true;
      // Out of the way, and not removed: its number is not the one wanted.
      storage().moveOver(path(name), storage().outside() + "/" + std::to_string(attempt));
    }
    return false;
  }
  bool fileWithNumberOf(const std::string& old, const std::string& name) {
    return replaceKeepingNumber(old, name,
                                [this](const std::string& at) { storage().createFile(at, "new"); });
  }
  bool folderWithNumberOf(const std::string& old, const std::string& name) {
    return replaceKeepingNumber(old, name,
                                [this](const std::string& at) { storage().createFolder(at); });
  }

  std::string path(const std::string& name) const { return _judged->path(name); }
  TestStorage& storage() { return _judged->storage; }

  std::unique_ptr<JudgedStorage> _judged;
};

TEST_F(InodeReuse, AnotherFileWithTheNumberIsAnotherDocument) {
  untilReused([this] {
    storage().createFile(path("a"), "old");
    _judged->look();
    const DocumentID old = _judged->ask("a");
    if (!fileWithNumberOf("a", "b")) return false;
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "");
    EXPECT_NE(_judged->ask("b"), old);
    return true;
  });
}

TEST_F(InodeReuse, ItIsAnotherDocumentAfterANewStartToo) {
  untilReused([this] {
    storage().createFile(path("a"), "old");
    _judged->look();
    const DocumentID old = _judged->ask("a");
    _judged->reopen();
    if (!fileWithNumberOf("a", "b")) return false;
    _judged->reopen();
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "");
    EXPECT_NE(_judged->ask("b"), old);
    return true;
  });
}

TEST_F(InodeReuse, TheSameNameAndNumberIsASavedDocument) {
  untilReused([this] {
    storage().createFile(path("a"), "old");
    storage().setAttribute(path("a"), kDate, "kept");
    _judged->look();
    const DocumentID document = _judged->ask("a");
    if (!fileWithNumberOf("a", "a")) return false;
    _judged->look();
    EXPECT_EQ(_judged->whereIs(document), "a");
    EXPECT_EQ(readAttributes(path("a")), (Attributes{{kDate, "kept"}}));
    return true;
  });
}

TEST_F(InodeReuse, ASavedFileWithTheNumberOfTheOldBackupIsTheDocument) {
  untilReused([this] {
    storage().createFile(path("a"), "old");
    storage().createFile(path("a~"), "older");
    _judged->look();
    const DocumentID document = _judged->ask("a");
    const DocumentID backup = _judged->ask("a~");
    const FileID number = _judged->fileAt("a~");
    storage().moveOver(path("a"), path("a~"));
    storage().createFile(path("a"), "new");
    if (_judged->fileAt("a") != number) return false;
    _judged->look();
    EXPECT_EQ(_judged->whereIs(document), "a");
    EXPECT_EQ(_judged->whereIs(backup), "a~");
    return true;
  });
}

TEST_F(InodeReuse, ANewFolderWithTheNumberHasNothingOfTheOldOne) {
  untilReused([this] {
    storage().createFolder(path("F"));
    storage().createFile(path("F/a"), "old");
    _judged->look();
    const DocumentID old = _judged->ask("F/a");
    if (!folderWithNumberOf("F", "G")) return false;
    storage().createFile(path("G/a"), "new");
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "");
    EXPECT_NE(_judged->ask("G/a"), old);
    return true;
  });
}

TEST_F(InodeReuse, ANewFolderWithNameAndNumberOfTheOldOneIsAnotherFolder) {
  untilReused([this] {
    storage().createFolder(path("F"));
    storage().createFile(path("F/a"), "old");
    _judged->look();
    const DocumentID old = _judged->ask("F/a");
    if (!folderWithNumberOf("F", "F")) return false;
    storage().createFile(path("F/a"), "new");
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "");
    EXPECT_NE(_judged->ask("F/a"), old);
    return true;
  });
}

TEST_F(InodeReuse, AFolderWithTheNumberOfADocumentIsNone) {
  untilReused([this] {
    storage().createFile(path("a"), "old");
    _judged->look();
    const DocumentID old = _judged->ask("a");
    if (!folderWithNumberOf("a", "F")) return false;
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "");
    return true;
  });
}

TEST_F(InodeReuse, ADocumentWithTheNumberOfAFolderIsNotMistakenForIt) {
  untilReused([this] {
    storage().createFolder(path("F"));
    storage().createFile(path("F/a"), "old");
    _judged->look();
    const DocumentID old = _judged->ask("F/a");
    storage().moveOver(path("F/a"), path("a"));
    if (!fileWithNumberOf("F", "F")) return false;
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "a");
    EXPECT_FALSE(_judged->catalog().entryCountOfFolder(_judged->fileAt("F")));
    return true;
  });
}

TEST_F(InodeReuse, ADocumentThatCameBackIsNotTheFileThatHasItsOldNumber) {
  untilReused([this] {
    storage().createFile(path("a"), "old");
    _judged->look();
    const DocumentID old = _judged->ask("a");
    storage().moveOver(path("a"), path(".a"));
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "");
    if (!fileWithNumberOf(".a", "a")) return false;
    _judged->look();
    EXPECT_EQ(_judged->whereIs(old), "");
    EXPECT_NE(_judged->ask("a"), old);
    return true;
  });
}

}  // namespace
}  // namespace vantrell::properties
