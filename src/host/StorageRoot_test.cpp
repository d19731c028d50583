#include "host/StorageRoot.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <fstream>

namespace vantrell::host {
namespace {

namespace fs = std::filesystem;
using testing::AllOf;
using testing::HasSubstr;

class StorageRootTest : public testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = fs::temp_directory_path() / "vantrell-root-XXXXXX";
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    _home = fs::canonical(pattern);
  }
  void TearDown() override { fs::remove_all(_home); }

  Result<std::string> rootFor(const std::optional<std::string>& given) {
    const auto environment = [this](const char* name) -> std::optional<std::string> {
      return std::string_view(name) == "HOME" ? std::optional(_home.native()) : std::nullopt;
    };
    return storageRoot(given, linuxos::XdgFolders(environment, "/"));
  }

  fs::path _home;
};

TEST_F(StorageRootTest, WithoutAnythingGivenItIsTheDocumentsFolder) {
  fs::create_directory(_home / "Documents");
  EXPECT_EQ(rootFor(std::nullopt), (_home / "Documents").native());
}

TEST_F(StorageRootTest, ItIsCanonical) {
  fs::create_directories(_home / "real/deep");
  fs::create_directory_symlink("real", _home / "link");
  EXPECT_EQ(rootFor(_home / "link/./deep/.."), (_home / "real").native());
}

TEST_F(StorageRootTest, AFolderThatIsNotThereIsToldSoWithWhatToDo) {
  const auto root = rootFor(std::nullopt);
  ASSERT_FALSE(root);
  EXPECT_TRUE(root.error().is(kFndFoundationErrorDomain, 260));
  EXPECT_THAT(root.error().message(), AllOf(HasSubstr(_home / "Documents"), HasSubstr("Create"),
                                            HasSubstr("--storage DIR")));
}

TEST_F(StorageRootTest, AFileIsNoFolder) {
  std::ofstream(_home / "file") << "x";
  const auto root = rootFor(_home / "file");
  ASSERT_FALSE(root);
  EXPECT_TRUE(root.error().isPosix(ENOTDIR));
  EXPECT_THAT(root.error().message(), HasSubstr("is no folder"));
}

TEST_F(StorageRootTest, AFolderBelowAFileIsNotThere) {
  std::ofstream(_home / "file") << "x";
  const auto root = rootFor(_home / "file/below");
  ASSERT_FALSE(root);
  EXPECT_TRUE(root.error().is(kFndFoundationErrorDomain, 260)) << root.error().description();
}

TEST_F(StorageRootTest, LinksThatGoRoundAreAnError) {
  fs::create_symlink("b", _home / "a");
  fs::create_symlink("a", _home / "b");
  const auto root = rootFor(_home / "a");
  ASSERT_FALSE(root);
  EXPECT_TRUE(root.error().isPosix(ELOOP));
}

TEST_F(StorageRootTest, AFolderThatMayNotBeReadIsRefused) {
  // The superuser may read every folder: a child that is somebody else finds out.
  fs::create_directory(_home / "closed");
  fs::permissions(_home, fs::perms::all);
  fs::permissions(_home / "closed", fs::perms::none);
  EXPECT_EXIT(
      {
        if (::geteuid() == 0 && (::setgid(65534) != 0 || ::setuid(65534) != 0)) ::_exit(2);
        const auto root = rootFor(_home / "closed");
        ::_exit(!root && root.error().isPosix(EACCES) ? 0 : 1);
      },
      testing::ExitedWithCode(0), "");
  fs::permissions(_home / "closed", fs::perms::owner_all);
}

TEST_F(StorageRootTest, AUserWithoutADocumentsFolderIsToldToNameOne) {
  fs::create_directory(_home / ".config");
  std::ofstream(_home / ".config/user-dirs.dirs") << "XDG_DOCUMENTS_DIR=\"$HOME/\"\n";
  const auto root = rootFor(std::nullopt);
  ASSERT_FALSE(root);
  EXPECT_TRUE(root.error().is(kVantrellErrorDomain, 8));
  EXPECT_THAT(root.error().message(), HasSubstr("--storage DIR"));
}

TEST(StorageRootWarning, APathWithADocumentsFolderNeedsNone) {
  EXPECT_EQ(storageRootWarning("/home/me/Documents"), std::nullopt);
  EXPECT_EQ(storageRootWarning("/home/Documents/deeper"), std::nullopt);
}

TEST(StorageRootWarning, AnyOtherPathHasNoTrash) {
  for (const char* path : {"/home/me/Dokumente", "/home/me/MyDocuments", "/documents", "/"}) {
    const auto warning = storageRootWarning(path);
    ASSERT_TRUE(warning) << path;
    EXPECT_THAT(*warning,
                AllOf(HasSubstr("no trash"), HasSubstr("--storage DIR"), HasSubstr("bind-mount")));
  }
}

}  // namespace
}  // namespace vantrell::host
