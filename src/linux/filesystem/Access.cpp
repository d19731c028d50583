#include "linux/filesystem/Access.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

namespace vantrell::linuxos {
namespace {

bool kernelGrants(int folder, const char* name, int access) {
  return ::faccessat(folder, name, access, AT_EACCESS | AT_SYMLINK_NOFOLLOW) == 0;
}

}  // namespace

MountAccess mountAccessOf(int folder) {
  struct statvfs volume;
  if (::fstatvfs(folder, &volume) != 0) return MountAccess::Unknown;
  return (volume.f_flag & ST_RDONLY) != 0 ? MountAccess::ReadOnly : MountAccess::ReadWrite;
}

ObjectAccess accessTo(int folder, const char* name, const ObjectStatus& status, MountAccess mount,
                      uid_t user) {
  // An owner's bits are the whole answer when they grant: no access list overrides them. Groups,
  // lists and privileges are the kernel's to weigh, at the price of a call.
  const bool owns = status.owner == user;
  const bool settledForWriting = mount == MountAccess::ReadWrite && !status.isMountPoint &&
                                 !status.isImmutable && (status.permissions & S_IWUSR) != 0;
  return {
      .readable = (owns && (status.permissions & S_IRUSR) != 0) || kernelGrants(folder, name, R_OK),
      .writable = (owns && settledForWriting) || kernelGrants(folder, name, W_OK)};
}

}  // namespace vantrell::linuxos
