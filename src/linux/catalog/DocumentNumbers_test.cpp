#include "linux/catalog/DocumentNumbers.h"

#include <sqlite3.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "linux/catalog/CatalogTestStorage.h"

namespace vantrell::linuxos {
namespace {

namespace fs = std::filesystem;

class DocumentNumbers : public CatalogTest {
 protected:
  DocumentID newDocument() {
    const std::string name = "n" + std::to_string(_number++);
    write(name);
    return idOf(name);
  }
  void lose(const char* name) { fs::remove(state(name)); }
  void loseDatabase() {
    close();
    for (const char* name : {"vantrell.db", "vantrell.db-wal", "vantrell.db-shm"}) lose(name);
  }
  void loseAttribute() {
    ::removexattr(path("").c_str(), "user.com.quillon.vantrell.document-ids");
  }
  void setNext(std::uint64_t next, std::uint64_t reserved) {
    close();
    sqlite3* database = nullptr;
    ASSERT_EQ(sqlite3_open(state("vantrell.db").c_str(), &database), SQLITE_OK);
    const std::string sql = "UPDATE state SET nextDocumentID = " + std::to_string(next) +
                            ", reservedDocumentID = " + std::to_string(reserved);
    ASSERT_EQ(sqlite3_exec(database, sql.c_str(), nullptr, nullptr, nullptr), SQLITE_OK);
    sqlite3_close(database);
  }

 private:
  int _number = 0;
};

TEST_F(DocumentNumbers, GrowAndAreNotTakenUpAgainAfterARestart) {
  look();
  const DocumentID one = newDocument();
  const DocumentID two = newDocument();
  close();
  const DocumentID three = newDocument();
  EXPECT_LT(one, two);
  EXPECT_LT(two, three);
}

TEST_F(DocumentNumbers, AreNotGivenAgainWhenTheDatabaseIsLost) {
  look();
  const DocumentID one = newDocument();
  loseDatabase();
  look();
  EXPECT_GT(newDocument(), one);
}

TEST_F(DocumentNumbers, AreNotGivenAgainWhenTheStateFolderIsLost) {
  look();
  // Far above what the clock says, so that only the storage folder's attribute can know.
  setNext(4'000'000'000, 4'000'000'000);
  const DocumentID one = newDocument();
  ASSERT_GE(one.value, 4'000'000'000);
  if (attribute("", "user.com.quillon.vantrell.document-ids") == "none") {
    GTEST_SKIP() << "no attributes on this file system";
  }
  loseDatabase();
  lose("document-ids");
  look();
  EXPECT_GT(newDocument(), one);
}

TEST_F(DocumentNumbers, AreNotGivenAgainWhenAnOldDatabaseComesBack) {
  look();
  setNext(4'000'000'000, 4'000'000'000);
  newDocument();
  close();
  fs::copy_file(state("vantrell.db"), state("backup"));
  DocumentID last;
  for (int i = 0; i < 3; ++i) last = newDocument();
  loseDatabase();
  loseAttribute();
  fs::rename(state("backup"), state("vantrell.db"));
  EXPECT_GT(newDocument(), last);
}

TEST_F(DocumentNumbers, ADamagedReservationIsReportedAndTheOthersDecide) {
  look();
  setNext(4'000'000'000, 4'000'000'000);
  const DocumentID one = newDocument();
  for (const char* damaged : {"", "x", "12x\n", "12", "-1\n", "99999999999999999999\n"}) {
    close();
    std::ofstream(state("document-ids")) << damaged;
    const std::size_t before = errorLines().size();
    EXPECT_GT(newDocument(), one) << damaged;
    ASSERT_EQ(errorLines().size(), before + 1) << damaged;
    EXPECT_EQ(errorLines().back(),
              "can't read the reserved document IDs in \"" + state("document-ids") +
                  "\"; the attribute of the storage folder and the clock decide");
  }
}

TEST_F(DocumentNumbers, RunningOutIsAnErrorAndNoNewBeginning) {
  look();
  setNext(0xFFFFFFFF, 0xFFFFFFFF);
  EXPECT_EQ(newDocument().value, 0xFFFFFFFF);
  write("one-more");
  const std::vector<SeenObject> objects{seen("one-more")};
  const auto ids = catalog().documentIDsOfObjects(fileID(""), objects);
  ASSERT_FALSE(ids);
  EXPECT_TRUE(ids.error().isPosix(EOVERFLOW));
  close();
  EXPECT_FALSE(catalog().documentIDsOfObjects(fileID(""), objects));
}

TEST_F(DocumentNumbers, AReservationThatCannotBeWrittenIsAnErrorAndNoIDIsTold) {
  look();
  write("a");
  fs::create_directory(state("document-ids.new"));
  const std::vector<SeenObject> objects{seen("a")};
  EXPECT_FALSE(catalog().documentIDsOfObjects(fileID(""), objects));
  EXPECT_EQ(knownIDOf("a"), DocumentID{});
  fs::remove(state("document-ids.new"));
  EXPECT_NE(idOf("a"), DocumentID{});
}

}  // namespace
}  // namespace vantrell::linuxos
