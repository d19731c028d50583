#include "tests/contracts/ContractTest.h"

namespace vantrell::testing {
namespace {

class OpenFileContract : public ContractTest {};

constexpr std::string_view kName = "com.quillon.test#PS";

TEST_P(OpenFileContract, NothingThereIsENOENT) {
  const auto file = system().fileSystem().open(url("/none"), OpenMode::EventOnly);
  EXPECT_TRUE(file.error().isPosix(ENOENT));
}

TEST_P(OpenFileContract, ALinkInThePathIsELOOP) {
  system().makeFolder("/real");
  system().writeFile("/real/file", "");
  system().makeLink("/link", "real");
  const auto file = system().fileSystem().open(url("/link/file"), OpenMode::EventOnly);
  EXPECT_TRUE(file.error().isPosix(ELOOP));
}

TEST_P(OpenFileContract, ALinkAtTheEndIsOpenedItself) {
  system().makeLink("/link", "nowhere");
  EXPECT_EQ(open("/link", OpenMode::EventOnly)->identity()->kind, FileKind::SymbolicLink);
}

TEST_P(OpenFileContract, AFifoIsOpenedWithoutWaiting) {
  system().makeFifo("/fifo");
  for (const OpenMode mode : {OpenMode::EventOnly, OpenMode::ReadOnly, OpenMode::ReadWrite}) {
    EXPECT_EQ(open("/fifo", mode)->identity()->kind, FileKind::Fifo);
  }
}

TEST_P(OpenFileContract, WhatMayNotBeWrittenCannotBeOpenedForWriting) {
  system().writeFile("/file", "");
  system().setMode("/file", 0400);
  const auto file = system().fileSystem().open(url("/file"), OpenMode::ReadWrite);
  EXPECT_TRUE(file.error().isPosix(EACCES));
}

TEST_P(OpenFileContract, WhatMayNotBeReadCanBeLookedAt) {
  system().writeFile("/file", "");
  system().setMode("/file", 0000);
  EXPECT_EQ(open("/file", OpenMode::EventOnly)->identity()->kind, FileKind::RegularFile);
}

TEST_P(OpenFileContract, AnAttributeThatWasSetIsReadBack) {
  system().writeFile("/file", "");
  system().makeFolder("/folder");
  for (const std::string path : {"/file", "/folder"}) {
    ASSERT_TRUE(setAttribute(path, kName, "first").has_value());
    EXPECT_EQ(*attribute(path, kName), "first");
    ASSERT_TRUE(setAttribute(path, kName, "2nd").has_value());
    EXPECT_EQ(*attribute(path, kName), "2nd");
  }
}

TEST_P(OpenFileContract, AnEmptyValueIsAValue) {
  system().writeFile("/file", "");
  ASSERT_TRUE(setAttribute("/file", kName, "").has_value());
  EXPECT_EQ(*attribute("/file", kName), "");
}

TEST_P(OpenFileContract, ARemovedAttributeIsGone) {
  system().writeFile("/file", "");
  ASSERT_TRUE(setAttribute("/file", kName, "value").has_value());
  const auto file = open("/file", OpenMode::ReadWrite);
  ASSERT_TRUE(file->removeAttribute(kName).has_value());
  EXPECT_TRUE(attribute("/file", kName).error().isPosix(ENODATA));
  EXPECT_TRUE(file->removeAttribute(kName).error().isPosix(ENODATA));
}

TEST_P(OpenFileContract, OnlyAFileOpenedForWritingTakesAttributes) {
  system().writeFile("/file", "");
  ASSERT_TRUE(setAttribute("/file", kName, "old").has_value());
  for (const OpenMode mode : {OpenMode::EventOnly, OpenMode::ReadOnly}) {
    const auto file = open("/file", mode);
    EXPECT_TRUE(file->setAttribute(kName, {}).error().isPosix(EACCES));
    EXPECT_TRUE(file->removeAttribute(kName).error().isPosix(EACCES));
  }
  EXPECT_EQ(*attribute("/file", kName), "old");
}

TEST_P(OpenFileContract, LinksAndFifosCarryNoAttributes) {
  system().makeLink("/link", "nowhere");
  system().makeFifo("/fifo");
  for (const std::string path : {"/link", "/fifo"}) {
    const auto set = setAttribute(path, kName, "value");
    ASSERT_FALSE(set.has_value()) << path;
    EXPECT_TRUE(set.error().isPosix(EPERM)) << path << set.error().description();
  }
}

TEST_P(OpenFileContract, AValueTooLargeIsRefusedAndTheOldOneStays) {
  system().writeFile("/file", "");
  ASSERT_TRUE(setAttribute("/file", kName, "old").has_value());
  const auto set = setAttribute("/file", kName, std::string(70'000, 'x'));
  ASSERT_FALSE(set.has_value());
  EXPECT_TRUE(set.error().isPosix(ENOSPC) || set.error().isPosix(E2BIG));
  EXPECT_EQ(*attribute("/file", kName), "old");
}

TEST_P(OpenFileContract, AnOpenedFileKeepsItsIdentityWhenItIsRenamedAndReplaced) {
  system().writeFile("/file", "");
  const auto file = open("/file", OpenMode::ReadWrite);
  const FileIdentity before = *file->identity();
  system().move("/file", "/renamed");
  system().writeFile("/file", "another");
  EXPECT_EQ(file->identity()->fileID, before.fileID);
  EXPECT_NE(fileID("/file"), before.fileID);
  ASSERT_TRUE(file->setAttribute(kName, {}).has_value());
  EXPECT_TRUE(attribute("/renamed", kName).has_value());
  EXPECT_FALSE(attribute("/file", kName).has_value());
}

TEST_P(OpenFileContract, EverythingOfTheStorageLiesOnOneVolume) {
  system().writeFile("/file", "");
  const DeviceID device = *open("", OpenMode::EventOnly)->deviceID();
  EXPECT_NE(device.value, 0U);
  EXPECT_EQ(*open("/file", OpenMode::EventOnly)->deviceID(), device);
}

TEST_P(OpenFileContract, AttributesAreReadWithoutFollowingLinks) {
  system().makeFolder("/real");
  system().writeFile("/real/file", "");
  ASSERT_TRUE(setAttribute("/real/file", kName, "value").has_value());
  system().makeLink("/link", "real/file");
  system().makeLink("/folder", "real");
  EXPECT_TRUE(attribute("/link", kName).error().isPosix(ENODATA));
  EXPECT_TRUE(attribute("/folder/file", kName).error().isPosix(ELOOP));
}

TEST_P(OpenFileContract, AnAttributeOfNothingIsENOENT) {
  EXPECT_TRUE(attribute("/none", kName).error().isPosix(ENOENT));
}

TEST_P(OpenFileContract, AValueThatHasGrownIsNotCutOff) {
  system().writeFile("/file", "");
  ASSERT_TRUE(setAttribute("/file", kName, "12345").has_value());
  FndData small(4);
  const auto copied = system().attributes().copyAttribute(url("/file"), kName, small);
  EXPECT_TRUE(copied.error().isPosix(ERANGE));
}

VANTRELL_CONTRACT(OpenFileContract);

}  // namespace
}  // namespace vantrell::testing
