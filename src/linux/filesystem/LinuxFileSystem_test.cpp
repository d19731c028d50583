#include "linux/filesystem/LinuxFileSystem.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <thread>

#include "linux/types/SharedMimeTypes.h"
#include "tests/contracts/TemporaryFolder.h"
#include "tests/fakes/FakeFileIndex.h"

namespace vantrell::linuxos {
namespace {

using vantrell::testing::AsOrdinaryUser;
using vantrell::testing::TemporaryFolder;
using Key = FndURLResourceKey;

class LinuxFileSystemTest : public ::testing::Test {
 protected:
  LinuxFileSystemTest() : _types({}), _index(_folder.path()), _fileSystem(_index, _types) {}

  static FndURL url(const std::string& path) { return FndURL::fileURLWithPath(path); }
  std::optional<FndURL::ResourceValue> value(const std::string& path, Key key) {
    const FndURL at = url(path);
    const std::array keys = {key};
    const auto read = _fileSystem.readResourceValues(at, keys);
    if (!read) throw std::runtime_error(read.error().description());
    return at.cachedResourceValue(key);
  }
  bool flag(const std::string& path, Key key) { return std::get<bool>(*value(path, key)); }
  std::string canonical(const std::string& path) {
    const auto found = _fileSystem.canonicalURL(url(path));
    return found ? found->path() : found.error().description();
  }
  const TemporaryFolder& folder() const { return _folder; }
  fakes::FakeFileIndex& index() { return _index; }
  LinuxFileSystem& fileSystem() { return _fileSystem; }

 private:
  TemporaryFolder _folder;
  SharedMimeTypes _types;
  fakes::FakeFileIndex _index;
  LinuxFileSystem _fileSystem;
};

TEST_F(LinuxFileSystemTest, AccessIsWhatTheEffectiveUserMayDo) {
  const AsOrdinaryUser ordinary;
  const std::string path = folder().writeFile("file");
  EXPECT_TRUE(flag(path, Key::IsReadable));
  EXPECT_TRUE(flag(path, Key::IsWritable));
  ASSERT_EQ(::chmod(path.c_str(), 0444), 0);
  EXPECT_FALSE(flag(path, Key::IsWritable));
  ASSERT_EQ(::chmod(path.c_str(), 0222), 0);
  EXPECT_FALSE(flag(path, Key::IsReadable));
  EXPECT_TRUE(flag(path, Key::IsWritable));
  EXPECT_TRUE(flag("/etc/passwd", Key::IsReadable));
  EXPECT_FALSE(flag("/etc/passwd", Key::IsWritable));
}

TEST_F(LinuxFileSystemTest, TheAccessOfAListedEntryIsTheOneReadByItsPath) {
  const AsOrdinaryUser ordinary;
  int number = 0;
  for (const mode_t mode : {0000U, 0400U, 0200U, 0600U, 0444U, 0755U}) {
    const std::string path = folder().writeFile("file" + std::to_string(number++));
    ASSERT_EQ(::chmod(path.c_str(), mode), 0);
  }
  const std::array keys = {Key::IsReadable, Key::IsWritable};
  const auto entries = fileSystem().enumerateDirectory(
      url(folder().path()), keys, 0, [](const FndURL&, const FndError&) { return true; });
  int listed = 0;
  for (; const auto entry = (*entries)->next(); ++listed) {
    for (const Key key : keys) {
      EXPECT_EQ(std::get<bool>(*entry->cachedResourceValue(key)), flag(entry->path(), key))
          << entry->path();
    }
  }
  EXPECT_EQ(listed, number);
}

// In a mount namespace of its own, which goes with the process.
enum ChildAnswer : int { kReadOnlySeen, kWritableSeen, kNoNamespace };

TEST_F(LinuxFileSystemTest, NothingOnAReadOnlyMountIsWritable) {
  const std::string path = folder().makeFolder("mounted");
  folder().writeFile("mounted/file");
  const pid_t child = ::fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    const int spaces = CLONE_NEWNS | (::geteuid() == 0 ? 0 : CLONE_NEWUSER);
    const bool mounted =
        ::unshare(spaces) == 0 &&
        ::mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
        ::mount(path.c_str(), path.c_str(), nullptr, MS_BIND, nullptr) == 0 &&
        ::mount(nullptr, path.c_str(), nullptr, MS_BIND | MS_REMOUNT | MS_RDONLY, nullptr) == 0;
    if (!mounted) ::_exit(kNoNamespace);
    const std::array keys = {Key::IsWritable};
    const auto entries = fileSystem().enumerateDirectory(
        url(path), keys, 0, [](const FndURL&, const FndError&) { return true; });
    const auto entry = (*entries)->next();
    const bool writable = flag(path, Key::IsWritable) || flag(path + "/file", Key::IsWritable) ||
                          std::get<bool>(*entry->cachedResourceValue(Key::IsWritable));
    const auto opened = fileSystem().open(url(path + "/file"), OpenMode::ReadWrite);
    const bool refused = !opened && opened.error().isPosix(EROFS);
    ::_exit(writable || !refused ? kWritableSeen : kReadOnlySeen);
  }
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  ASSERT_TRUE(WIFEXITED(status));
  if (WEXITSTATUS(status) == kNoNamespace) GTEST_SKIP() << "no mount namespaces for this user";
  EXPECT_EQ(WEXITSTATUS(status), kReadOnlySeen);
}

TEST_F(LinuxFileSystemTest, TheCatalogSaysHowManyEntriesAFolderHas) {
  const std::string path = folder().makeFolder("sub");
  const FileID fileID = fileSystem().status(url(path))->fileID;
  index().setEntryCount(fileID, 5);
  EXPECT_EQ(fileSystem().status(url(path))->linkCount, 7U);
  const std::string link = folder().makeLink("link", path);
  EXPECT_EQ(fileSystem().status(url(link))->linkCount, 7U);
}

TEST_F(LinuxFileSystemTest, AFolderThatIsNotCataloguedHasTheLinkCountOfTheDisk) {
  const std::string path = folder().makeFolder("sub");
  struct stat status;
  ASSERT_EQ(::stat(path.c_str(), &status), 0);
  EXPECT_EQ(fileSystem().status(url(path))->linkCount, status.st_nlink);
}

TEST_F(LinuxFileSystemTest, ReadingADocumentIdentifierAllocatesNone) {
  const std::string path = folder().writeFile("note");
  EXPECT_FALSE(value(path, Key::DocumentIdentifier));
  EXPECT_TRUE(index().batches().empty());
}

TEST_F(LinuxFileSystemTest, TheContentVersionIsTimeAndSizeInSixteenBytes) {
  const std::string path = folder().writeFile("note", "abc");
  const timespec times[2] = {{1, 0}, {1, 2}};  // 1,000,000,002 ns: 0x3B9ACA02
  ASSERT_EQ(::utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
  EXPECT_EQ(std::get<FndData>(*value(path, Key::ContentVersion)),
            (FndData{0x02, 0xca, 0x9a, 0x3b, 0, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0}));
}

TEST_F(LinuxFileSystemTest, CanonicalPathsHaveNoLinksInTheirFolders) {
  folder().makeFolder("real");
  folder().makeFolder("real/sub");
  folder().makeLink("absolute", folder().path("real"));
  folder().makeLink("real/sub/up", "../..");
  const std::string root = folder().path();
  EXPECT_EQ(canonical(root + "/absolute/sub/file"), root + "/real/sub/file");
  EXPECT_EQ(canonical(root + "/absolute/sub/up/real/sub"), root + "/real/sub");
  EXPECT_EQ(canonical(root + "/absolute/sub/.."), root + "/real");
  EXPECT_EQ(canonical(root + "/absolute/sub/up/.."), root.substr(0, root.rfind('/')));
  EXPECT_EQ(canonical("/../.."), "/");
  EXPECT_EQ(canonical("/"), "/");
}

TEST_F(LinuxFileSystemTest, ALinkAtTheEndOfACanonicalPathStays) {
  const std::string link = folder().makeLink("link", "nowhere");
  EXPECT_EQ(canonical(link), link);
}

TEST_F(LinuxFileSystemTest, OnlyTheEndOfACanonicalPathMayBeMissing) {
  EXPECT_EQ(canonical(folder().path("none")), folder().path("none"));
  EXPECT_TRUE(fileSystem().canonicalURL(url(folder().path("none/x"))).error().isPosix(ENOENT));
  folder().writeFile("file");
  EXPECT_TRUE(fileSystem().canonicalURL(url(folder().path("file/x"))).error().isPosix(ENOTDIR));
}

TEST_F(LinuxFileSystemTest, LinksThatLeadInCirclesHaveNoCanonicalPath) {
  folder().makeLink("a", "b");
  folder().makeLink("b", "a");
  const auto found = fileSystem().canonicalURL(url(folder().path("a/file")));
  EXPECT_TRUE(found.error().isPosix(ELOOP)) << found.error().description();
}

TEST_F(LinuxFileSystemTest, ManyThreadsCanMakeTheSameFoldersAtOnce) {
  const FndURL deep = url(folder().path("a/b/c/d/e"));
  std::vector<std::thread> threads;
  for (int i = 0; i < 8; ++i) {
    threads.emplace_back([&] { EXPECT_TRUE(fileSystem().createDirectory(deep).has_value()); });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_TRUE(std::filesystem::is_directory(deep.path()));
}

TEST_F(LinuxFileSystemTest, AFolderIsNotMadeThroughALink) {
  const TemporaryFolder elsewhere;
  folder().makeLink("link", elsewhere.path());
  const auto made = fileSystem().createDirectory(url(folder().path("link/sub")));
  EXPECT_FALSE(made.has_value());
  EXPECT_FALSE(std::filesystem::exists(elsewhere.path("sub")));
}

TEST_F(LinuxFileSystemTest, ASizeThatCannotBeReadWhollyIsAnError) {
  const AsOrdinaryUser ordinary;
  folder().makeFolder("sub");
  ASSERT_EQ(::chmod(folder().path("sub").c_str(), 0000), 0);
  EXPECT_TRUE(fileSystem().recursiveSizeOfDirectory(url(folder().path())).error().isPosix(EACCES));
}

TEST_F(LinuxFileSystemTest, SpecialFilesAreLookedAtWithoutBeingOpened) {
  for (const std::string& path : {folder().makeFifo("fifo"), folder().makeSocket("socket")}) {
    EXPECT_FALSE(flag(path, Key::IsDirectory));
    EXPECT_TRUE(fileSystem().status(url(path)).has_value());
    EXPECT_TRUE(flag(path, Key::IsReadable));
  }
}

}  // namespace
}  // namespace vantrell::linuxos
