#include "support/AttributeAccess.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "support/Errors.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

constexpr std::string_view kName = "com.quillon.note";

class AttributeAccessTest : public testing::Test {
 protected:
  std::unique_ptr<OpenFile> open(OpenMode mode = OpenMode::ReadWrite) {
    auto file = system.fileSystem.open(url, mode);
    EXPECT_TRUE(file.has_value());
    return std::move(*file);
  }
  std::string logged(LogLevel level) const {
    const auto texts = system.log.textsAt(level);
    EXPECT_EQ(system.log.lines().size(), 1U);
    return texts.size() == 1 ? texts.front() : "not one line of that level";
  }

  TestSystem system;
  const FndURL url = system.file("a.txt");
};

TEST_F(AttributeAccessTest, TheValueOfAnAttributeIsRead) {
  system.tree.setAttribute(url.path(), kName, {1, 2, 3});
  EXPECT_EQ(initWithValueOfXattr_at(kName, url), (FndData{1, 2, 3}));
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(AttributeAccessTest, AFileWithoutTheAttributeYieldsNoneAndNoLogLine) {
  EXPECT_EQ(initWithValueOfXattr_at(kName, url), std::nullopt);
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(AttributeAccessTest, AnAttributeOfLength0YieldsEmptyDataNotNone) {
  system.tree.setAttribute(url.path(), kName, {});
  EXPECT_EQ(initWithValueOfXattr_at(kName, url), FndData());
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(AttributeAccessTest, AFinalLinkIsNotFollowed) {
  system.tree.setAttribute(url.path(), kName, {1});
  system.tree.makeLink(system.inStorage("link"), "a.txt");
  EXPECT_EQ(initWithValueOfXattr_at(kName, system.urlInStorage("link")), std::nullopt);
}

TEST_F(AttributeAccessTest, AFileThatIsNotThereIsADebugLine) {
  EXPECT_EQ(initWithValueOfXattr_at(kName, system.urlInStorage("gone")), std::nullopt);
  EXPECT_EQ(logged(LogLevel::Debug), "[DEBUG] can't get xattr com.quillon.note; " +
                                         errorWithPOSIXCode(ENOENT).description());
}

TEST_F(AttributeAccessTest, AnyOtherFailureToGetTheSizeIsAnErrorLine) {
  system.tree.faults.failNext(FakeCall::SizeOfAttribute, {FndError::posix(EIO)});
  EXPECT_EQ(initWithValueOfXattr_at(kName, url), std::nullopt);
  EXPECT_EQ(logged(LogLevel::Error),
            "[ERROR] can't get xattr com.quillon.note; " + errorWithPOSIXCode(EIO).description());
}

TEST_F(AttributeAccessTest, AValueThatGrewInBetweenIsAnErrorLine) {
  system.tree.setAttribute(url.path(), kName, {1});
  system.tree.faults.failNext(FakeCall::CopyAttribute, {FndError::posix(ERANGE)});
  EXPECT_EQ(initWithValueOfXattr_at(kName, url), std::nullopt);
  EXPECT_EQ(logged(LogLevel::Error), "[ERROR] can't copy data for xattr com.quillon.note; " +
                                         errorWithPOSIXCode(ERANGE).description());
}

TEST_F(AttributeAccessTest, AFileThatWentInBetweenIsADebugLine) {
  system.tree.setAttribute(url.path(), kName, {1});
  system.tree.faults.failNext(FakeCall::CopyAttribute, {FndError::posix(ENOENT)});
  EXPECT_EQ(initWithValueOfXattr_at(kName, url), std::nullopt);
  EXPECT_EQ(logged(LogLevel::Debug), "[DEBUG] can't copy data for xattr com.quillon.note; " +
                                         errorWithPOSIXCode(ENOENT).description());
}

TEST_F(AttributeAccessTest, SettingCreatesAnAttributeAndReplacesIt) {
  const auto file = open();
  EXPECT_TRUE(setOrRemoveXattr(*file, kName, FndData{1}));
  EXPECT_TRUE(setOrRemoveXattr(*file, kName, FndData{2, 3}));
  EXPECT_EQ(system.tree.attribute(url.path(), kName), (FndData{2, 3}));
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(AttributeAccessTest, RemovingTakesTheAttributeAway) {
  system.tree.setAttribute(url.path(), kName, {1});
  EXPECT_TRUE(setOrRemoveXattr(*open(), kName, std::nullopt));
  EXPECT_EQ(system.tree.attribute(url.path(), kName), std::nullopt);
}

TEST_F(AttributeAccessTest, RemovingAnAttributeThatIsNotThereSucceeds) {
  EXPECT_TRUE(setOrRemoveXattr(*open(), kName, std::nullopt));
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(AttributeAccessTest,
       SettingAnAttributeOnAFileOpenedReadOnlyFailsWithThePermissionErrorAtDebugLevel) {
  const auto set = setOrRemoveXattr(*open(OpenMode::ReadOnly), kName, FndData{1});
  ASSERT_FALSE(set);
  EXPECT_TRUE(set.error().isPosix(EACCES));
  EXPECT_EQ(logged(LogLevel::Debug), "[DEBUG] can't set xattr \"com.quillon.note\"; " +
                                         errorWithPOSIXCode(EACCES).description());
}

TEST_F(AttributeAccessTest, AValueTooLargeIsAnErrorLineAndTheOldValueStays) {
  system.tree.setAttribute(url.path(), kName, {1});
  const auto set = setOrRemoveXattr(*open(), kName, FndData(5000));
  ASSERT_FALSE(set);
  EXPECT_TRUE(set.error().isPosix(ENOSPC));
  EXPECT_EQ(logged(LogLevel::Error), "[ERROR] can't set xattr \"com.quillon.note\"; " +
                                         errorWithPOSIXCode(ENOSPC).description());
  EXPECT_EQ(system.tree.attribute(url.path(), kName), FndData{1});
}

TEST_F(AttributeAccessTest, ARemovalThatFailsIsAnErrorLine) {
  system.tree.faults.failNext(FakeCall::RemoveAttribute, {FndError::posix(EIO)});
  const auto removed = setOrRemoveXattr(*open(), kName, std::nullopt);
  ASSERT_FALSE(removed);
  EXPECT_TRUE(removed.error().isPosix(EIO));
  EXPECT_EQ(logged(LogLevel::Error), "[ERROR] can't remove xattr \"com.quillon.note\"; " +
                                         errorWithPOSIXCode(EIO).description());
}

TEST_F(AttributeAccessTest, ARemovalThatIsNotPermittedIsADebugLine) {
  EXPECT_FALSE(setOrRemoveXattr(*open(OpenMode::ReadOnly), kName, std::nullopt));
  EXPECT_EQ(logged(LogLevel::Debug), "[DEBUG] can't remove xattr \"com.quillon.note\"; " +
                                         errorWithPOSIXCode(EACCES).description());
}

}  // namespace
}  // namespace vantrell
