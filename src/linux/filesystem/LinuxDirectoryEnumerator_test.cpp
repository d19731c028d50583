#include "linux/filesystem/LinuxDirectoryEnumerator.h"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <map>
#include <thread>

#include "linux/filesystem/LinuxExtendedAttributes.h"
#include "linux/filesystem/LinuxFileSystem.h"
#include "linux/types/SharedMimeTypes.h"
#include "tests/contracts/TemporaryFolder.h"
#include "tests/fakes/FakeFileIndex.h"

namespace vantrell::linuxos {
namespace {

using vantrell::testing::AsOrdinaryUser;
using vantrell::testing::TemporaryFolder;
using Key = FndURLResourceKey;

constexpr std::array kPrefetched = {
    Key::ParentDirectoryURL,      Key::Name,       Key::LocalizedName,
    Key::TypeIdentifier,          Key::FileSize,   Key::CreationDate,
    Key::ContentModificationDate, Key::IsReadable, Key::IsWritable};

class LinuxDirectoryEnumeratorTest : public ::testing::Test {
 protected:
  LinuxDirectoryEnumeratorTest()
      : _types(declarePackages()), _index(_folder.path()), _fileSystem(_index, _types) {}

  std::unique_ptr<DirectoryEnumerator> enumerate(std::uint8_t options) {
    auto made =
        _fileSystem.enumerateDirectory(FndURL::fileURLWithPath(_folder.path()), kPrefetched,
                                       options, [this](const FndURL& url, const FndError& error) {
                                         _errors.emplace_back(url.path(), error);
                                         return true;
                                       });
    if (!made) throw std::runtime_error(made.error().description());
    return *std::move(made);
  }
  std::map<std::string, FndURL> list(std::uint8_t options) {
    std::map<std::string, FndURL> listed;
    const auto entries = enumerate(options);
    while (auto url = entries->next()) {
      listed.emplace(url->path().substr(_folder.path().size() + 1), *url);
    }
    return listed;
  }
  const TemporaryFolder& folder() const { return _folder; }
  fakes::FakeFileIndex& index() { return _index; }
  const std::vector<std::pair<std::string, FndError>>& errors() const { return _errors; }

 private:
  TypeFolders declarePackages() {
    _declarations.writeFile("p.ini", "[test.package]\nextensions=pkg;\n");
    return {.dataFolders = {}, .packageTypeFolders = {_declarations.path()}};
  }

  TemporaryFolder _folder;
  TemporaryFolder _declarations;
  SharedMimeTypes _types;
  fakes::FakeFileIndex _index;
  LinuxFileSystem _fileSystem;
  std::vector<std::pair<std::string, FndError>> _errors;
};

TEST_F(LinuxDirectoryEnumeratorTest, AnEntryCarriesItsValuesWithoutTheDiskBeingAskedAgain) {
  folder().writeFile("note", "12345");
  const FndURL url = list(0).at("note");
  std::filesystem::remove(folder().path("note"));
  EXPECT_EQ(std::get<FndURL>(*url.cachedResourceValue(Key::ParentDirectoryURL)).path(),
            folder().path());
  EXPECT_EQ(std::get<std::string>(*url.cachedResourceValue(Key::Name)), "note");
  EXPECT_EQ(std::get<FndNumber>(*url.cachedResourceValue(Key::FileSize)),
            FndNumber(std::uint64_t{5}));
  EXPECT_EQ(std::get<bool>(*url.cachedResourceValue(Key::IsWritable)), true);
  for (const Key key : kPrefetched) EXPECT_TRUE(url.cachedResourceValue(key)) << int(key);
}

TEST_F(LinuxDirectoryEnumeratorTest, TheDocumentIDsOfAFolderAreAskedForInOneQuestion) {
  for (int i = 0; i < 200; ++i) folder().writeFile("note " + std::to_string(i));
  folder().makeFolder("sub");
  folder().makeFolder("whole.pkg");
  folder().makeLink("link", "sub");
  const auto listed = list(kSkipsPackageDescendants);
  ASSERT_EQ(index().batches().size(), 1U);
  EXPECT_EQ(index().batches()[0].documents.size(), 201U);
  EXPECT_TRUE(listed.at("note 7").cachedResourceValue(Key::DocumentIdentifier));
  EXPECT_TRUE(listed.at("whole.pkg").cachedResourceValue(Key::DocumentIdentifier));
  EXPECT_FALSE(listed.at("sub").cachedResourceValue(Key::DocumentIdentifier));
  EXPECT_FALSE(listed.at("link").cachedResourceValue(Key::DocumentIdentifier));
  EXPECT_TRUE(listed.at("sub").cachedResourceValue(Key::FileResourceIdentifier));
}

TEST_F(LinuxDirectoryEnumeratorTest, WithoutAnAnswerFromTheIndexEntriesComeWithoutDocumentIDs) {
  folder().writeFile("note");
  index().setBatchError(EIO);
  const auto listed = list(0);
  EXPECT_FALSE(listed.at("note").cachedResourceValue(Key::DocumentIdentifier));
  EXPECT_TRUE(listed.at("note").cachedResourceValue(Key::Name));
  EXPECT_TRUE(errors().empty());
}

TEST_F(LinuxDirectoryEnumeratorTest, FileIDsGivenOutInAFolderThatIsNotCataloguedAreNoted) {
  folder().makeFolder("sub");
  list(kSkipsSubdirectoryDescendants);
  ASSERT_EQ(index().seenObjects().size(), 1U);
  EXPECT_EQ(index().seenObjects()[0].path, folder().path("sub"));
}

TEST_F(LinuxDirectoryEnumeratorTest, ACataloguedFolderIsNotNotedAgain) {
  folder().makeFolder("sub");
  struct stat status;
  ASSERT_EQ(::stat(folder().path().c_str(), &status), 0);
  index().setEntryCount(FileID{status.st_ino}, 1);
  list(kSkipsSubdirectoryDescendants);
  EXPECT_TRUE(index().seenObjects().empty());
}

TEST_F(LinuxDirectoryEnumeratorTest, PackagesAreListedAndEnteredOnlyWhenAsked) {
  folder().makeFolder("whole.PKG");
  folder().writeFile("whole.PKG/inside");
  EXPECT_EQ(list(kSkipsPackageDescendants).size(), 1U);
  EXPECT_EQ(list(0).size(), 2U);
}

TEST_F(LinuxDirectoryEnumeratorTest, AnUnreadableFolderBelowGoesToTheErrorHandler) {
  const AsOrdinaryUser ordinary;
  folder().makeFolder("closed");
  ASSERT_EQ(::chmod(folder().path("closed").c_str(), 0000), 0);
  EXPECT_EQ(list(0).size(), 1U);
  ASSERT_EQ(errors().size(), 1U);
  EXPECT_EQ(errors()[0].first, folder().path("closed"));
  EXPECT_TRUE(errors()[0].second.isPosix(EACCES));
}

TEST_F(LinuxDirectoryEnumeratorTest, AFolderThatVanishesGoesToTheErrorHandlerAsNoSuchFile) {
  folder().makeFolder("going");
  const auto entries = enumerate(0);
  ASSERT_TRUE(entries->next());
  ASSERT_EQ(::rmdir(folder().path("going").c_str()), 0);
  EXPECT_FALSE(entries->next());
  ASSERT_EQ(errors().size(), 1U);
  EXPECT_TRUE(errors()[0].second.is(kFndFoundationErrorDomain, 260));
}

TEST_F(LinuxDirectoryEnumeratorTest, TheEntryInHandIsAskedThroughTheFolderItWasReadFrom) {
  folder().makeFolder("sub");
  const std::string path = folder().writeFile("sub/note");
  ASSERT_EQ(::setxattr(path.c_str(), "user.a", "1", 1, 0), 0);
  const auto entries = enumerate(0);
  ASSERT_TRUE(entries->next());
  const auto url = entries->next();
  ASSERT_EQ(url->path(), path);
  ASSERT_EQ(std::rename(folder().path("sub").c_str(), folder().path("moved").c_str()), 0);

  LinuxExtendedAttributes attributes;
  EXPECT_EQ(*attributes.sizeOfAttribute(*url, "a"), 1U);
  // Asked by its path, it is not there any more: for another URL object, on another thread, ...
  const FndURL equal = FndURL::fileURLWithPath(path);
  EXPECT_TRUE(attributes.sizeOfAttribute(equal, "a").error().isPosix(ENOENT));
  std::thread([&] {
    EXPECT_TRUE(attributes.sizeOfAttribute(*url, "a").error().isPosix(ENOENT));
  }).join();
  // ... and once the next entry has been taken.
  EXPECT_FALSE(entries->next());
  EXPECT_TRUE(attributes.sizeOfAttribute(*url, "a").error().isPosix(ENOENT));
}

TEST_F(LinuxDirectoryEnumeratorTest, AnEntryIsOutOfHandWhenItsEnumeratorIsGone) {
  const std::string path = folder().writeFile("note");
  std::optional<FndURL> url;
  {
    const auto entries = enumerate(0);
    url = entries->next();
  }
  ASSERT_EQ(std::rename(path.c_str(), folder().path("moved").c_str()), 0);
  EXPECT_TRUE(LinuxExtendedAttributes().sizeOfAttribute(*url, "a").error().isPosix(ENOENT));
}

TEST_F(LinuxDirectoryEnumeratorTest, NamesThatAreNoUTF8AreGivenByteForByte) {
  const std::string name = "bad \xff\xc3 name";
  folder().writeFile(name);
  EXPECT_EQ(list(0).count(name), 1U);
}

}  // namespace
}  // namespace vantrell::linuxos
