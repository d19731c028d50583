#include "linux/types/SharedMimeTypes.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <random>

#include "tests/contracts/TemporaryFolder.h"

namespace vantrell::linuxos {
namespace {

using vantrell::testing::TemporaryFolder;

// A data folder with the files of a database, and one that is less important.
class SharedMimeTypesTest : public ::testing::Test {
 protected:
  SharedMimeTypesTest() {
    for (const TemporaryFolder* folder : {&_user, &_system}) {
      folder->makeFolder("mime");
      folder->makeFolder("mime/text");
      folder->makeFolder("vantrell");
      folder->makeFolder("vantrell/package-types");
    }
  }
  SharedMimeTypes load() const {
    return SharedMimeTypes(
        {.dataFolders = {_user.path(), _system.path()}, .packageTypeFolders = {}});
  }
  static std::string typeOf(const SharedMimeTypes& types, std::string_view name) {
    return types.typeIdentifierForName(name, FileKind::RegularFile);
  }
  const TemporaryFolder& user() const { return _user; }
  const TemporaryFolder& system() const { return _system; }

 private:
  TemporaryFolder _user;
  TemporaryFolder _system;
};

TEST_F(SharedMimeTypesTest, WithoutADatabaseFilesArePlainDataAndOthersAreToldApart) {
  system().writeFile("vantrell/package-types/p.ini", "[test.package]\nextensions=pkg;\n");
  const SharedMimeTypes types = load();
  EXPECT_TRUE(types.databaseFolders().empty());
  EXPECT_EQ(typeOf(types, "a.txt"), kDataTypeIdentifier);
  EXPECT_EQ(types.typeIdentifierForName("a.txt", FileKind::Directory), kFolderTypeIdentifier);
  EXPECT_EQ(types.typeIdentifierForName("a.pkg", FileKind::Directory), "test.package");
  EXPECT_EQ(types.typeIdentifierForName("a.pkg", FileKind::SymbolicLink),
            kSymbolicLinkTypeIdentifier);
  EXPECT_TRUE(types.typeConformsTo("text/x-any", "text/plain"));
}

TEST_F(SharedMimeTypesTest, TheUsersDatabaseCountsBeforeTheSystems) {
  user().writeFile("mime/globs2", "50:a/user:*.x\n");
  system().writeFile("mime/globs2", "50:a/system:*.x\n50:a/y:*.y\n");
  const SharedMimeTypes types = load();
  EXPECT_EQ(typeOf(types, "n.x"), "a/user");
  EXPECT_EQ(typeOf(types, "n.y"), "a/y");
  EXPECT_EQ(types.databaseFolders().size(), 2U);
}

TEST_F(SharedMimeTypesTest, NoGlobsTakesAwayWhatLessImportantFoldersSay) {
  user().writeFile("mime/globs2", "0:a/x:__NOGLOBS__\n50:a/x:*.new\n");
  system().writeFile("mime/globs2", "50:a/x:*.old\n50:a/z:*.z\n");
  const SharedMimeTypes types = load();
  EXPECT_EQ(typeOf(types, "n.old"), kDataTypeIdentifier);
  EXPECT_EQ(typeOf(types, "n.new"), "a/x");
  EXPECT_EQ(typeOf(types, "n.z"), "a/z");
}

TEST_F(SharedMimeTypesTest, ConformanceFollowsSupertypesAndAliases) {
  system().writeFile("mime/globs2", "");
  system().writeFile("mime/subclasses", "a/c a/b\na/b a/a\n");
  system().writeFile("mime/aliases", "a/old-c a/c\na/old-a a/a\n");
  const SharedMimeTypes types = load();
  EXPECT_TRUE(types.typeConformsTo("a/c", "a/a"));
  EXPECT_FALSE(types.typeConformsTo("a/a", "a/c"));
  EXPECT_TRUE(types.typeConformsTo("a/old-c", "a/old-a"));
  EXPECT_TRUE(types.typeConformsTo("a/old-c", "a/c"));
  EXPECT_TRUE(types.typeConformsTo("a/c", "a/old-c"));
}

TEST_F(SharedMimeTypesTest, SomeConformanceGoesWithoutSaying) {
  const SharedMimeTypes types = load();
  EXPECT_TRUE(types.typeConformsTo("image/png", kDataTypeIdentifier));
  EXPECT_TRUE(types.typeConformsTo("text/html", "text/plain"));
  EXPECT_TRUE(types.typeConformsTo("text/html", kDataTypeIdentifier));
  EXPECT_FALSE(types.typeConformsTo("image/png", "text/plain"));
  EXPECT_FALSE(types.typeConformsTo(kFolderTypeIdentifier, kDataTypeIdentifier));
  EXPECT_FALSE(types.typeConformsTo(kSymbolicLinkTypeIdentifier, kDataTypeIdentifier));
}

TEST_F(SharedMimeTypesTest, SupertypesInACircleEnd) {
  system().writeFile("mime/globs2", "");
  system().writeFile("mime/subclasses", "a/a a/b\na/b a/c\na/c a/a\na/d a/d\n");
  const SharedMimeTypes types = load();
  EXPECT_TRUE(types.typeConformsTo("a/a", "a/c"));
  EXPECT_FALSE(types.typeConformsTo("a/a", "a/none"));
  EXPECT_FALSE(types.typeConformsTo("a/d", "a/none"));
}

TEST_F(SharedMimeTypesTest, PackagesConformToThePackageTypeAndNotToFoldersOrData) {
  system().writeFile("vantrell/package-types/p.ini", "[test.package]\nextensions=pkg\n");
  const SharedMimeTypes types = load();
  EXPECT_TRUE(types.typeConformsTo("test.package", kPackageTypeIdentifier));
  EXPECT_TRUE(types.typeConformsTo("test.package", "test.package"));
  EXPECT_FALSE(types.typeConformsTo("test.package", kFolderTypeIdentifier));
  EXPECT_FALSE(types.typeConformsTo("test.package", kDataTypeIdentifier));
  EXPECT_FALSE(types.typeConformsTo(kFolderTypeIdentifier, kPackageTypeIdentifier));
  EXPECT_FALSE(types.typeConformsTo("undeclared.package", kPackageTypeIdentifier));
}

TEST_F(SharedMimeTypesTest, AFolderIsAPackageByItsDeclaredExtensionAlone) {
  user().writeFile("vantrell/package-types/a.ini",
                   "[first.type]\nextensions = PKG ; multi.part;\n");
  system().writeFile("vantrell/package-types/b.ini", "[second.type]\nextensions=pkg;own;\n");
  const SharedMimeTypes types = load();
  const auto folderType = [&types](std::string_view name) {
    return types.typeIdentifierForName(name, FileKind::Directory);
  };
  EXPECT_EQ(folderType("x.pkg"), "first.type");
  EXPECT_EQ(folderType("x.PkG"), "first.type");
  EXPECT_EQ(folderType("x.own"), "second.type");
  EXPECT_EQ(folderType("x.multi.part"), "first.type");
  EXPECT_EQ(folderType("x.part"), kFolderTypeIdentifier);
  EXPECT_EQ(folderType("pkg"), kFolderTypeIdentifier);
  EXPECT_EQ(folderType(".pkg"), kFolderTypeIdentifier);
  EXPECT_EQ(folderType("x.pkg.txt"), kFolderTypeIdentifier);
  EXPECT_EQ(typeOf(types, "x.pkg"), kDataTypeIdentifier);
}

TEST_F(SharedMimeTypesTest, DescriptionsAreReadWhereTheyAre) {
  system().writeFile("mime/globs2", "");
  system().writeFile("mime/text/plain.xml",
                     "<mime-type><comment xml:lang=\"de\">Klartext</comment>"
                     "<comment>plain &lt;text&gt; &amp;amp;</comment></mime-type>");
  system().writeFile("vantrell/package-types/p.ini", "[test.package]\ndescription=A package\n");
  const SharedMimeTypes types = load();
  EXPECT_EQ(types.descriptionOfType("text/plain"), "plain <text> &amp;");
  EXPECT_EQ(types.descriptionOfType("test.package"), "A package");
  EXPECT_EQ(types.descriptionOfType("text/none"), "text/none");
  EXPECT_EQ(types.descriptionOfType("../mime/text/plain"), "../mime/text/plain");
  EXPECT_EQ(types.descriptionOfType(""), "");
}

TEST_F(SharedMimeTypesTest, DamagedFilesGiveWhatCanBeMadeOutOfThem) {
  const std::string longLine(10'000'000, 'x');
  system().writeFile(
      "mime/globs2",
      "50:a/x:*.x\n" + longLine +
          "\n50\n:\n::\nx:a/b:*.b\n50:nothing:*.n\n50:a/c:\n"
          "99999999999:a/d:*.d\n50:\xff\xfe/x:*.e\n50:a/f:*.\xff\n50:a/y:*.y:cs,junk");
  system().writeFile("mime/subclasses", "a/x\n a/x\na/x  a/y\n\xff \xff\na/y a/z\n" + longLine);
  system().writeFile("mime/aliases", longLine + "\na/only\na/o a/x\n");
  system().writeFile("mime/text/plain.xml", "<comment>never closed");
  system().writeFile("vantrell/package-types/p.ini",
                     "extensions=early\n[\n[]\n[bad type]\nextensions=bad\n[ok.type]\n=x\n"
                     "extensions\nextensions=ok;;;\n" +
                         longLine);
  const SharedMimeTypes types = load();
  EXPECT_EQ(typeOf(types, "n.x"), "a/x");
  EXPECT_EQ(typeOf(types, "n.y"), "a/y");
  EXPECT_EQ(typeOf(types, "n.b"), kDataTypeIdentifier);
  EXPECT_EQ(typeOf(types, "n.d"), kDataTypeIdentifier);
  EXPECT_EQ(typeOf(types, "n.n"), kDataTypeIdentifier);
  EXPECT_EQ(typeOf(types, "n.\xff"), "a/f");
  EXPECT_TRUE(types.typeConformsTo("a/y", "a/z"));
  EXPECT_TRUE(types.typeConformsTo("a/o", "a/x"));
  EXPECT_EQ(types.descriptionOfType("text/plain"), "text/plain");
  EXPECT_EQ(types.typeIdentifierForName("n.ok", FileKind::Directory), "ok.type");
  EXPECT_EQ(types.typeIdentifierForName("n.bad", FileKind::Directory), kFolderTypeIdentifier);
  EXPECT_EQ(types.typeIdentifierForName("n.early", FileKind::Directory), kFolderTypeIdentifier);
}

TEST_F(SharedMimeTypesTest, RandomBytesForADatabaseDoNoHarm) {
  std::random_device device;
  const char* given = std::getenv("VANTRELL_SEED");
  const unsigned long seed = given != nullptr ? std::stoul(given) : device();
  std::cout << "VANTRELL_SEED=" << seed << "\n";
  std::mt19937_64 random(seed);
  for (int round = 0; round < 50; ++round) {
    std::string bytes(2000, '\0');
    constexpr std::string_view kLikely = "50:a/b:*.[]?x\n #;=\r\0\xff";
    for (char& c : bytes) c = kLikely[random() % kLikely.size()];
    for (const char* name :
         {"mime/globs2", "mime/aliases", "mime/subclasses", "vantrell/package-types/p.ini"}) {
      system().writeFile(name, bytes);
    }
    const SharedMimeTypes types = load();
    EXPECT_FALSE(typeOf(types, bytes.substr(0, 100)).empty());
    types.typeConformsTo("a/b", "b/a");
  }
}

// The installed database of the machine, where there is one: it is what users have.
TEST(InstalledMimeTypes, UsualNamesHaveTheirTypes) {
  if (!std::filesystem::exists("/usr/share/mime/globs2")) {
    GTEST_SKIP() << "no shared MIME database on this machine";
  }
  const SharedMimeTypes types({.dataFolders = {"/usr/share"}, .packageTypeFolders = {}});
  const auto typeOf = [&types](std::string_view name) {
    return types.typeIdentifierForName(name, FileKind::RegularFile);
  };
  EXPECT_EQ(typeOf("a.txt"), "text/plain");
  EXPECT_EQ(typeOf("A.PDF"), "application/pdf");
  EXPECT_EQ(typeOf("a.tar.gz"), "application/x-compressed-tar");
  EXPECT_EQ(typeOf("Makefile"), "text/x-makefile");
  EXPECT_EQ(typeOf("main.C"), "text/x-c++src");
  EXPECT_EQ(typeOf("main.c"), "text/x-csrc");
  EXPECT_EQ(typeOf("libc.so.6"), "application/x-sharedlib");
  EXPECT_EQ(typeOf("note.txt~"), "application/x-trash");
  EXPECT_TRUE(types.typeConformsTo("text/x-c++src", "text/plain"));
  EXPECT_EQ(types.descriptionOfType("text/plain"), "plain text document");
}

// What the project ships.
TEST(ShippedPackageTypes, DeclareBothFamilies) {
  const SharedMimeTypes types(
      {.dataFolders = {}, .packageTypeFolders = {VANTRELL_SHIPPED_PACKAGE_TYPES}});
  const auto folderType = [&types](std::string_view name) {
    return types.typeIdentifierForName(name, FileKind::Directory);
  };
  EXPECT_TRUE(folderType("a.tessera").starts_with("com.quillon.tessera."));
  EXPECT_TRUE(folderType("a.brindle").starts_with("com.quillon.brindle."));
  EXPECT_TRUE(types.typeConformsTo(folderType("a.tessera"), kPackageTypeIdentifier));
  EXPECT_NE(types.descriptionOfType(folderType("a.brindle")), folderType("a.brindle"));
}

}  // namespace
}  // namespace vantrell::linuxos
