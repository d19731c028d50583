#include "linux/filesystem/LinuxVolumes.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>

#include "linux/filesystem/VolumeIdentity.h"
#include "tests/contracts/TemporaryFolder.h"
#include "tests/fakes/FakeFileIndex.h"

namespace vantrell::linuxos {
namespace {

using vantrell::testing::rawAttribute;
using vantrell::testing::TemporaryFolder;

constexpr const char* kAttribute = "user.com.quillon.vantrell.volume-uuid";

class KeptVolumeUUID : public ::testing::Test {
 protected:
  FndUUID kept(const std::string& path) {
    const FileDescriptor root(::open(path.c_str(), O_RDONLY | O_DIRECTORY));
    const auto uuid = keptVolumeUUID(root.get(), lookAt(root.get(), "", AT_EMPTY_PATH)->fileID);
    if (!uuid) throw std::runtime_error("no volume UUID, error " + std::to_string(uuid.error()));
    return *uuid;
  }
  void set(const std::string& path, const std::string& value) {
    ASSERT_EQ(::setxattr(path.c_str(), kAttribute, value.data(), value.size(), 0), 0);
  }
  const TemporaryFolder& folder() const { return _folder; }

 private:
  TemporaryFolder _folder;
};

TEST_F(KeptVolumeUUID, IsMadeOnceAndThenStays) {
  const FndUUID first = kept(folder().path());
  EXPECT_FALSE(first.isZero());
  EXPECT_EQ(kept(folder().path()), first);
  EXPECT_NE(rawAttribute(folder().path(), kAttribute).find(first.description()), std::string::npos);
}

TEST_F(KeptVolumeUUID, StaysWhenTheFolderIsRenamed) {
  const std::string path = folder().makeFolder("storage");
  const FndUUID first = kept(path);
  std::filesystem::rename(path, folder().path("renamed"));
  EXPECT_EQ(kept(folder().path("renamed")), first);
}

TEST_F(KeptVolumeUUID, OfACopyIsItsOwn) {
  const std::string original = folder().makeFolder("storage");
  const FndUUID first = kept(original);
  const std::string copy = folder().makeFolder("copy");
  set(copy, rawAttribute(original, kAttribute));
  EXPECT_NE(kept(copy), first);
  EXPECT_EQ(kept(copy), kept(copy));
  EXPECT_EQ(kept(original), first);
}

TEST_F(KeptVolumeUUID, IsMadeAnewWhenTheAttributeIsDamaged) {
  const FndUUID zero(FndUUID::Bytes{});
  for (const std::string& damaged :
       {std::string(), std::string("x"), std::string(200, 'x'), zero.description(),
        FndUUID::random().description(), FndUUID::random().description() + " 1"}) {
    set(folder().path(), damaged);
    const FndUUID made = kept(folder().path());
    EXPECT_FALSE(made.isZero());
    EXPECT_EQ(kept(folder().path()), made);
  }
}

TEST(BlockDeviceUUID, IsTheNameOfTheLinkToTheDevice) {
  const TemporaryFolder links;
  const std::string uuid = "00112233-4455-6677-8899-AABBCCDDEEFF";
  links.makeLink("1234-ABCD", "/dev/null");
  links.makeLink("99999999-4455-6677-8899-AABBCCDDEEFF", "/dev/null");  // no block device
  EXPECT_EQ(blockDeviceUUID(links.path(), makedev(1, 3)), std::nullopt);
  for (const auto& entry : std::filesystem::directory_iterator("/sys/class/block")) {
    const std::string device = "/dev/" + entry.path().filename().string();
    struct stat status;
    if (::stat(device.c_str(), &status) != 0 || !S_ISBLK(status.st_mode)) continue;
    links.makeLink(uuid, device);
    ASSERT_TRUE(blockDeviceUUID(links.path(), status.st_rdev)) << device;
    EXPECT_EQ(blockDeviceUUID(links.path(), status.st_rdev)->description(), uuid);
    EXPECT_EQ(blockDeviceUUID(links.path(), makedev(250, 250)), std::nullopt);
    break;
  }
  EXPECT_EQ(blockDeviceUUID(links.path("none"), makedev(8, 1)), std::nullopt);
}

TEST(LinuxVolumes, EveryFileOfTheStorageHasTheSameVolume) {
  const TemporaryFolder folder;
  fakes::FakeFileIndex index(folder.path());
  const auto uuidAt = [&](const std::string& path) {
    return LinuxVolumes(index, folder.path()).volumeUUIDForURL(FndURL::fileURLWithPath(path));
  };
  const auto ofRoot = uuidAt(folder.path());
  ASSERT_TRUE(ofRoot.has_value()) << ofRoot.error().description();
  EXPECT_FALSE(ofRoot->isZero());
  EXPECT_EQ(*uuidAt(folder.writeFile("file")), *ofRoot);
  EXPECT_EQ(*uuidAt(folder.makeLink("link", "nowhere")), *ofRoot);
}

TEST(LinuxVolumes, AFileIDLeadsToItsPathOnTheStoragesVolumeOnly) {
  const TemporaryFolder folder;
  fakes::FakeFileIndex index(folder.path());
  LinuxVolumes volumes(index, folder.path());
  const std::string path = folder.writeFile("file");
  struct stat status;
  ASSERT_EQ(::stat(path.c_str(), &status), 0);
  const DeviceID device = deviceID(major(status.st_dev), minor(status.st_dev));
  EXPECT_EQ(*volumes.pathForFileID(device, FileID{status.st_ino}), path);
  EXPECT_TRUE(volumes.pathForFileID(device, FileID{0}).error().isPosix(ENOENT));
  const DeviceID other{device.value + 1};
  EXPECT_TRUE(volumes.pathForFileID(other, FileID{status.st_ino}).error().isPosix(ENODEV));
}

TEST(LinuxVolumes, WithoutAStorageRootThereAreErrorsAndNoGuesses) {
  const TemporaryFolder folder;
  fakes::FakeFileIndex index(folder.path());
  LinuxVolumes volumes(index, folder.path("none"));
  EXPECT_TRUE(volumes.pathForFileID(DeviceID{1}, FileID{1}).error().isPosix(ENOENT));
  EXPECT_TRUE(
      volumes.volumeUUIDForURL(FndURL::fileURLWithPath(folder.path())).error().isPosix(ENOENT));
}

}  // namespace
}  // namespace vantrell::linuxos
