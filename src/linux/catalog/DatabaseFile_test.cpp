#include <sqlite3.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <iterator>

#include "linux/catalog/CatalogTestStorage.h"

namespace vantrell::linuxos {
namespace {

namespace fs = std::filesystem;

class DatabaseFile : public CatalogTest {
 protected:
  /// A closed database with one document.
  DocumentID made() {
    write("a");
    look();
    const DocumentID a = idOf("a");
    close();
    return a;
  }

  std::string bytes(const std::string& file) const {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
  }
  void setBytes(const std::string& file, const std::string& content) {
    std::ofstream(file, std::ios::binary | std::ios::trunc) << content;
  }
  void run(const char* sql) {
    sqlite3* database = nullptr;
    ASSERT_EQ(sqlite3_open(state("vantrell.db").c_str(), &database), SQLITE_OK);
    ASSERT_EQ(sqlite3_exec(database, sql, nullptr, nullptr, nullptr), SQLITE_OK)
        << sqlite3_errmsg(database);
    sqlite3_close(database);
  }
  std::vector<std::string> setAside() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(folder() + "/state")) {
      const std::string name = entry.path().filename();
      if (name.starts_with("vantrell.db.damaged-")) names.push_back(name);
    }
    return names;
  }
  /// What opening says; empty when it works.
  std::string openingError() {
    const auto opened = Catalog::open(options());
    if (opened) return "";
    EXPECT_TRUE(opened.error().is(kVantrellErrorDomain,
                                  static_cast<int>(VantrellErrorCode::StateUnavailable)));
    return opened.error().message();
  }
};

TEST_F(DatabaseFile, WhatIsNoDatabaseIsSetAsideAndANewOneBuilt) {
  const DocumentID a = made();
  setBytes(state("vantrell.db"), "this is no database at all");
  EXPECT_EQ(look().created, 1U);
  ASSERT_EQ(setAside().size(), 1U);
  EXPECT_EQ(bytes(state(setAside().front())), "this is no database at all");
  ASSERT_EQ(errorLines().size(), 1U);
  EXPECT_EQ(errorLines().front(), "the database \"" + state("vantrell.db") +
                                      "\" is damaged; it is kept as \"" +
                                      state(setAside().front()) + "\", and a new one is built");
  EXPECT_GT(idOf("a"), a) << "an ID was given a second time";
}

TEST_F(DatabaseFile, ACutDatabaseGivesNoIDTwice) {
  const DocumentID original = made();
  DocumentID last = original;
  const std::string whole = bytes(state("vantrell.db"));
  int rebuilt = 0;
  for (std::size_t size = 0; size < whole.size(); size += whole.size() / 16 + 7) {
    setBytes(state("vantrell.db"), whole.substr(0, size));
    const bool isNew = look().created == 1;
    const DocumentID a = idOf("a");
    // Where only the unused end of a page is missing, nothing is.
    EXPECT_TRUE(isNew ? a > last : a == original) << size;
    last = std::max(a, last);
    rebuilt += isNew ? 1 : 0;
    EXPECT_EQ(lookAfterRestart().created, 0U) << size;
    close();
  }
  EXPECT_GE(rebuilt, 14);
}

TEST_F(DatabaseFile, FlippedAndRepeatedBytesNeverStopItAndNeverGiveAnIDToAnotherDocument) {
  write("b");
  const DocumentID a = made();
  const DocumentID b = idOf("b");
  close();
  const std::string whole = bytes(state("vantrell.db"));
  const std::string numbers = bytes(state("document-ids"));
  // Behind the header: what it says of foreign and newer databases is another test's.
  for (std::size_t at = 100; at < whole.size(); at += 1201) {
    for (const bool flip : {true, false}) {
      std::string damaged = whole;
      if (flip) damaged[at] = static_cast<char>(damaged[at] ^ 0x55);
      if (!flip) damaged.replace(at, 64, whole.substr(at - 64, 64));
      damaged.resize(whole.size());
      setBytes(state("vantrell.db"), damaged);
      close();
      const auto opened = Catalog::open(options());
      ASSERT_TRUE(opened) << opened.error().description();
      const auto report = (*opened)->look();
      ASSERT_TRUE(report) << at << " " << report.error().description();
      const auto file = (*opened)->fileIDOfDocument(a);
      EXPECT_FALSE(file && *file == fileID("b")) << at;
      for (const std::string& name : setAside()) fs::remove(state(name));
      fs::remove(state("vantrell.db-wal"));
      fs::remove(state("vantrell.db-shm"));
    }
  }
  EXPECT_NE(a, b);
  EXPECT_FALSE(numbers.empty());
}

TEST_F(DatabaseFile, ADatabaseOfAnotherProgramIsLeftAlone) {
  made();
  run("PRAGMA application_id = 1234");
  const std::string before = bytes(state("vantrell.db"));
  EXPECT_EQ(openingError(), "\"" + state("vantrell.db") +
                                "\" is the database of another program. Move it away, or choose "
                                "another state folder.");
  EXPECT_EQ(bytes(state("vantrell.db")), before);
}

TEST_F(DatabaseFile, ADatabaseOfANewerVersionIsLeftAlone) {
  made();
  run("PRAGMA user_version = 2");
  const std::string before = bytes(state("vantrell.db"));
  EXPECT_EQ(openingError(), "\"" + state("vantrell.db") +
                                "\" was written by a newer version (its tables have version 2, "
                                "this program knows version 1). Use that version, or move the file "
                                "away to start afresh.");
  EXPECT_EQ(bytes(state("vantrell.db")), before);
}

TEST_F(DatabaseFile, ADatabaseWithAMissingTableIsSetAside) {
  made();
  run("DROP TABLE documents");
  EXPECT_EQ(look().created, 1U);
  EXPECT_EQ(setAside().size(), 1U);
}

TEST_F(DatabaseFile, DamageFoundAfterAStopThatWasNotCleanIsSetAside) {
  made();
  run("UPDATE state SET stoppedCleanly = 0");
  run("PRAGMA writable_schema = ON;"
      "UPDATE sqlite_schema SET rootpage = 3 WHERE name = 'documentsByHome'");
  look();
  EXPECT_EQ(setAside().size(), 1U);
}

TEST_F(DatabaseFile, AStateFolderThatCannotBeMadeIsAClearError) {
  write("a");
  CatalogOptions wrong = options();
  wrong.stateFolder = path("a") + "/state";
  const auto opened = Catalog::open(std::move(wrong));
  ASSERT_FALSE(opened);
  EXPECT_TRUE(opened.error().message().starts_with("can't make the state folder \"" + path("a")));
}

TEST_F(DatabaseFile, AFolderInItsPlaceIsAClearError) {
  fs::create_directory(state("vantrell.db"));
  EXPECT_TRUE(openingError().starts_with("can't use \"" + state("vantrell.db") + "\": "));
  EXPECT_TRUE(fs::is_directory(state("vantrell.db")));
}

TEST_F(DatabaseFile, AReadOnlyDatabaseIsAClearErrorAndStaysAsItIs) {
  made();
  const std::string before = bytes(state("vantrell.db"));
  becomeOrdinaryUser();
  ASSERT_EQ(::chmod(state("vantrell.db").c_str(), 0400), 0);
  ASSERT_EQ(::chmod(state("").c_str(), 0500), 0);
  const std::string error = openingError();
  ASSERT_EQ(::chmod(state("").c_str(), 0700), 0);
  EXPECT_TRUE(error.starts_with("can't use \"" + state("vantrell.db") + "\": ")) << error;
  EXPECT_TRUE(
      error.ends_with("Check that the folder and the file are yours, that you may write "
                      "them, and that the disk has room."))
      << error;
  EXPECT_EQ(bytes(state("vantrell.db")), before);
}

TEST_F(DatabaseFile, ADatabaseThatMayBeWrittenAgainIsUsedAgain) {
  made();
  becomeOrdinaryUser();
  ASSERT_EQ(::chmod(state("vantrell.db").c_str(), 0400), 0);
  EXPECT_TRUE(openingError().starts_with("can't use \"" + state("vantrell.db") + "\": "));
  ASSERT_EQ(::chmod(state("vantrell.db").c_str(), 0600), 0);
  EXPECT_TRUE(Catalog::open(options()));
}

TEST_F(DatabaseFile, TwoCatalogsOnOneStateFolderNeverGiveOneIDTwice) {
  for (int i = 0; i < 20; ++i) write("f" + std::to_string(i));
  look();
  auto other = Catalog::open(options());
  ASSERT_TRUE(other);
  ASSERT_TRUE((*other)->look());
  std::set<DocumentID> ids;
  for (int i = 0; i < 20; ++i) {
    const std::string name = "f" + std::to_string(i);
    const std::vector<SeenObject> objects{seen(name)};
    Catalog& asked = i % 2 == 0 ? catalog() : **other;
    Catalog& checked = i % 2 == 0 ? **other : catalog();
    const auto id = asked.documentIDsOfObjects(fileID(""), objects);
    ASSERT_TRUE(id) << id.error().description();
    ids.insert(id->front());
    EXPECT_EQ(checked.documentIDsOfObjects(fileID(""), objects)->front(), id->front());
  }
  EXPECT_EQ(ids.size(), 20U);
}

}  // namespace
}  // namespace vantrell::linuxos
