#include "linux/filesystem/VolumeIdentity.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <memory>
#include <string_view>

namespace vantrell::linuxos {
namespace {

constexpr const char* kVolumeAttribute = "user.com.quillon.vantrell.volume-uuid";

// FS_IOC_GETFSUUID, since Linux 6.9; the C library's headers do not have it yet.
struct FileSystemUUID {
  std::uint8_t length;
  std::uint8_t bytes[16];
};
constexpr unsigned long kGetFileSystemUUID = _IOR(0x15, 0, FileSystemUUID);

std::string attributeText(const FndUUID& uuid, FileID rootID) {
  return uuid.description() + ' ' + std::to_string(rootID.value);
}

// None when there is no value, or one that was made for another folder.
std::optional<FndUUID> readKept(int root, FileID rootID) {
  std::array<char, 64> buffer;
  const ssize_t size = ::fgetxattr(root, kVolumeAttribute, buffer.data(), buffer.size());
  if (size < 0) return std::nullopt;
  const std::string_view text(buffer.data(), static_cast<std::size_t>(size));
  const auto uuid = FndUUID::fromString(text.substr(0, std::min<std::size_t>(36, text.size())));
  if (!uuid || uuid->isZero() || text != attributeText(*uuid, rootID)) return std::nullopt;
  return uuid;
}

}  // namespace

std::optional<FndUUID> fileSystemUUID(int folder) {
  FileSystemUUID answer{};
  if (::ioctl(folder, kGetFileSystemUUID, &answer) != 0) return std::nullopt;
  if (answer.length != sizeof answer.bytes) return std::nullopt;
  FndUUID::Bytes bytes;
  std::copy(std::begin(answer.bytes), std::end(answer.bytes), bytes.begin());
  const FndUUID uuid(bytes);
  if (uuid.isZero()) return std::nullopt;
  return uuid;
}

std::optional<FndUUID> blockDeviceUUID(const std::string& folder, dev_t device) {
  const std::unique_ptr<DIR, int (*)(DIR*)> links(::opendir(folder.c_str()), ::closedir);
  if (links == nullptr) return std::nullopt;
  while (const dirent* entry = ::readdir(links.get())) {
    const auto uuid = FndUUID::fromString(entry->d_name);
    if (!uuid || uuid->isZero()) continue;  // FAT and others have shorter ones, good for little
    struct stat target;
    const bool seen = ::fstatat(::dirfd(links.get()), entry->d_name, &target, 0) == 0;
    if (seen && S_ISBLK(target.st_mode) && target.st_rdev == device) return uuid;
  }
  return std::nullopt;
}

OsResult<FndUUID> keptVolumeUUID(int root, FileID rootID) {
  if (const auto kept = readKept(root, rootID)) return *kept;
  ::fremovexattr(root, kVolumeAttribute);  // one that came along with a copy
  const FndUUID made = FndUUID::random();
  const std::string text = attributeText(made, rootID);
  const int failed = ::fsetxattr(root, kVolumeAttribute, text.data(), text.size(), XATTR_CREATE);
  int osError = errno;
  // Another process may make one at the same time: the first stands.
  if (failed != 0 && osError != EEXIST) return std::unexpected(osError);
  const bool durable = ::fsync(root) == 0;
  osError = errno;
  if (!durable) return std::unexpected(osError);
  const auto kept = readKept(root, rootID);
  if (!kept) return std::unexpected(EIO);
  return *kept;
}

}  // namespace vantrell::linuxos
