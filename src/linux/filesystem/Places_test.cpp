#include "linux/filesystem/Places.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cerrno>

#include "linux/filesystem/ObjectStatus.h"
#include "tests/contracts/TemporaryFolder.h"

namespace vantrell::linuxos {
namespace {

// Makes `levels` folders with names of `length` bytes, one in the other, and a file in the last.
std::string makeDeep(const std::string& root, int levels, std::size_t length) {
  std::string path = root;
  FileDescriptor folder(::open(root.c_str(), O_PATH | O_DIRECTORY));
  for (int i = 0; i < levels; ++i) {
    const std::string name = std::to_string(i) + std::string(length, 'd');
    EXPECT_EQ(::mkdirat(folder.get(), name.c_str(), 0755), 0);
    folder = FileDescriptor(::openat(folder.get(), name.c_str(), O_PATH | O_DIRECTORY));
    path += '/' + name;
  }
  const FileDescriptor file(::openat(folder.get(), "file", O_CREAT | O_WRONLY, 0644));
  EXPECT_TRUE(file);
  return path + "/file";
}

TEST(Places, APathOfAThousandLongNamesIsOpened) {
  const vantrell::testing::TemporaryFolder folder;
  const std::string path = makeDeep(folder.path(), 1000, 200);
  EXPECT_GT(path.size(), 200'000U);
  EXPECT_TRUE(openWithoutLinks(AT_FDCWD, path, O_PATH | O_NOFOLLOW).has_value());
  const auto place = placeOf(path);
  ASSERT_TRUE(place.has_value());
  EXPECT_EQ(place->name, "file");
  EXPECT_EQ(lookAt(place->folder.get(), place->name.data())->kind, FileKind::RegularFile);
}

TEST(Places, ALinkFarDownALongPathIsRefused) {
  const vantrell::testing::TemporaryFolder folder;
  const std::string path = makeDeep(folder.path(), 30, 200);
  const vantrell::testing::TemporaryFolder elsewhere;
  const std::string link = elsewhere.makeLink("link", folder.path());
  const std::string through = link + path.substr(folder.path().size());
  EXPECT_GT(through.size(), 5000U);
  EXPECT_EQ(openWithoutLinks(AT_FDCWD, through, O_PATH).error(), ELOOP);
}

TEST(Places, ANameThatIsTooLongIsAnError) {
  const vantrell::testing::TemporaryFolder folder;
  EXPECT_EQ(openWithoutLinks(AT_FDCWD, folder.path(std::string(256, 'n')), O_PATH).error(),
            ENAMETOOLONG);
  EXPECT_EQ(openWithoutLinks(AT_FDCWD, '/' + std::string(5000, 'n'), O_PATH).error(), ENAMETOOLONG);
}

TEST(Places, ANulByteCutsNoPathShort) {
  const vantrell::testing::TemporaryFolder folder;
  folder.writeFile("a");
  const std::string path = folder.path(std::string("a\0b", 3));
  EXPECT_EQ(openWithoutLinks(AT_FDCWD, path, O_PATH).error(), EINVAL);
  EXPECT_EQ(placeOf(path).error(), EINVAL);
}

TEST(Places, TheRootIsFoundInItself) {
  const auto place = placeOf("/");
  ASSERT_TRUE(place.has_value());
  EXPECT_EQ(place->name, ".");
  EXPECT_EQ(lookAt(place->folder.get(), place->name.data())->kind, FileKind::Directory);
}

TEST(Places, WhatIsNoAbsolutePathHasNoPlace) {
  EXPECT_EQ(placeOf("").error(), EINVAL);
  EXPECT_EQ(placeOf("name").error(), EINVAL);
}

TEST(ObjectStatus, DeviceNumbersArePackedAsTheKernelPacksThem) {
  EXPECT_EQ(deviceID(8, 1).value, 0x00000801U);
  EXPECT_EQ(deviceID(0xabc, 0x12345).value, 0x123abc45U);
}

TEST(ObjectStatus, ADateTooFarAwayBecomesTheFurthestThatFits) {
  EXPECT_EQ(nanosecondsSince1970(FndDate::fromUnixTime(1, 5)), 1'000'000'005);
  EXPECT_EQ(nanosecondsSince1970(FndDate::fromUnixTime(-1, 5)), -999'999'995);
  EXPECT_EQ(nanosecondsSince1970(FndDate::fromUnixTime(15'000'000'000)), INT64_MAX);
  EXPECT_EQ(nanosecondsSince1970(FndDate::fromUnixTime(-15'000'000'000)), INT64_MIN);
}

}  // namespace
}  // namespace vantrell::linuxos
