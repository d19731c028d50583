#include <array>

#include "tests/contracts/ContractTest.h"

namespace vantrell::testing {
namespace {

using Key = FndURLResourceKey;

class FileValuesContract : public ContractTest {
 protected:
  Result<void> read(const FndURL& at, Key key) {
    const std::array keys = {key};
    return system().fileSystem().readResourceValues(at, keys);
  }
  std::optional<FndURL::ResourceValue> value(const std::string& path, Key key) {
    const FndURL at = url(path);
    if (const auto done = read(at, key); !done) {
      throw std::runtime_error(path + ": " + done.error().description());
    }
    return at.cachedResourceValue(key);
  }
  std::string text(const std::string& path, Key key) {
    return std::get<std::string>(*value(path, key));
  }
  bool flag(const std::string& path, Key key) { return std::get<bool>(*value(path, key)); }
};

TEST_P(FileValuesContract, WhereNothingIsThereIsNoSuchFile) {
  EXPECT_TRUE(isNoSuchFile(read(url("/none"), Key::Name).error()));
  EXPECT_TRUE(isNoSuchFile(read(url("/none/none"), Key::Name).error()));
  system().writeFile("/file", "");
  EXPECT_TRUE(isNoSuchFile(read(url("/file/none"), Key::Name).error()));
}

TEST_P(FileValuesContract, ALinkInThePathIsAnError) {
  system().makeFolder("/real");
  system().writeFile("/real/file", "");
  system().makeLink("/link", system().root() + "/real");
  const auto done = read(url("/link/file"), Key::Name);
  ASSERT_FALSE(done.has_value());
  EXPECT_TRUE(done.error().isPosix(ELOOP)) << done.error().description();
}

TEST_P(FileValuesContract, AFileHasAllItsValues) {
  system().makeFolder("/sub");
  system().writeFile("/sub/note.txt", "12345");
  const std::string path = "/sub/note.txt";
  EXPECT_EQ(std::get<FndURL>(*value(path, Key::ParentDirectoryURL)), url("/sub"));
  EXPECT_EQ(text(path, Key::Name), "note.txt");
  EXPECT_EQ(text(path, Key::LocalizedName), "note.txt");
  EXPECT_EQ(text(path, Key::TypeIdentifier), "text/plain");
  EXPECT_EQ(std::get<FndNumber>(*value(path, Key::FileSize)), FndNumber(std::uint64_t{5}));
  EXPECT_TRUE(std::holds_alternative<FndDate>(*value(path, Key::ContentModificationDate)));
  EXPECT_FALSE(flag(path, Key::IsDirectory));
  EXPECT_FALSE(flag(path, Key::IsPackage));
  EXPECT_EQ(std::get<FndNumber>(*value(path, Key::FileResourceIdentifier)),
            FndNumber(fileID(path).value));
}

TEST_P(FileValuesContract, AFolderHasNoSizeAndIsNoPackage) {
  system().makeFolder("/sub");
  EXPECT_FALSE(value("/sub", Key::FileSize));
  EXPECT_TRUE(flag("/sub", Key::IsDirectory));
  EXPECT_FALSE(flag("/sub", Key::IsPackage));
  EXPECT_EQ(text("/sub", Key::TypeIdentifier), kFolderTypeIdentifier);
}

TEST_P(FileValuesContract, APackageIsADirectoryThatPeopleSeeAsOneDocument) {
  system().makeFolder("/whole.pouch");
  EXPECT_TRUE(flag("/whole.pouch", Key::IsDirectory));
  EXPECT_TRUE(flag("/whole.pouch", Key::IsPackage));
  EXPECT_EQ(text("/whole.pouch", Key::TypeIdentifier), "org.example.pouch");
}

TEST_P(FileValuesContract, ALinkIsLookedAtAndNotFollowed) {
  system().makeFolder("/sub.pouch");
  system().makeLink("/link", "sub.pouch");
  EXPECT_FALSE(flag("/link", Key::IsDirectory));
  EXPECT_FALSE(flag("/link", Key::IsPackage));
  EXPECT_EQ(text("/link", Key::TypeIdentifier), kSymbolicLinkTypeIdentifier);
}

TEST_P(FileValuesContract, ReadingAgainReplacesWhatTheURLRemembers) {
  system().writeFile("/file", "1");
  const FndURL at = url("/file");
  ASSERT_TRUE(read(at, Key::FileSize).has_value());
  system().writeFile("/file", "123");
  ASSERT_TRUE(read(at, Key::FileSize).has_value());
  EXPECT_EQ(std::get<FndNumber>(*at.cachedResourceValue(Key::FileSize)),
            FndNumber(std::uint64_t{3}));
}

TEST_P(FileValuesContract, TheContentVersionChangesWithTheContent) {
  system().writeFile("/file", "1");
  const auto before = value("/file", Key::ContentVersion);
  ASSERT_TRUE(before);
  EXPECT_EQ(value("/file", Key::ContentVersion), before);
  system().writeFile("/file", "12");
  EXPECT_NE(value("/file", Key::ContentVersion), before);
}

TEST_P(FileValuesContract, AccessIsThatOfTheCaller) {
  system().writeFile("/file", "");
  for (const unsigned mode : {0600U, 0400U, 0200U, 0000U}) {
    system().setMode("/file", mode);
    EXPECT_EQ(flag("/file", Key::IsReadable), (mode & 0400U) != 0) << mode;
    EXPECT_EQ(flag("/file", Key::IsWritable), (mode & 0200U) != 0) << mode;
  }
}

TEST_P(FileValuesContract, ADocumentIdentifierIsThereOnceThereIsOne) {
  system().writeFile("/file", "");
  EXPECT_FALSE(value("/file", Key::DocumentIdentifier));
  const DocumentID allocated = allocate("/file");
  EXPECT_EQ(std::get<FndNumber>(*value("/file", Key::DocumentIdentifier)),
            FndNumber(std::uint64_t{allocated.value}));
}

TEST_P(FileValuesContract, AFifoIsLookedAtWithoutWaiting) {
  system().makeFifo("/fifo");
  EXPECT_FALSE(flag("/fifo", Key::IsDirectory));
  EXPECT_FALSE(value("/fifo", Key::FileSize));
}

VANTRELL_CONTRACT(FileValuesContract);

}  // namespace
}  // namespace vantrell::testing
