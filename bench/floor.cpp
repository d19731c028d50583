// The least that a listing can cost: floor ROOT look|attribute|record
//
//   look       getdents64 and statx of every entry: what it takes to see that nothing changed
//   attribute  besides, open and one fgetxattr of every file
//   record     besides, open and three fgetxattr of every entry: what a full item record holds
//
// Prints one line of JSON: entries and milliseconds.

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <string>
#include <string_view>
#include <vector>

namespace {

struct KernelEntry {
  std::uint64_t inode;
  std::int64_t offset;
  std::uint16_t length;
  std::uint8_t type;
  char name[1];
};

constexpr std::array<const char*, 3> kAttributes = {"user.com.quillon.lastuseddate#PS",
                                                    "user.com.quillon.metadata:_kMDItemUserTags",
                                                    "user.com.quillon.favorite-rank.number#PS"};

class Walk {
 public:
  explicit Walk(std::size_t attributes) : _attributes(attributes) {}

  long entries() const { return _entries; }

  void folder(int fd) {
    std::vector<std::string> subfolders;
    std::vector<char> buffer(65536);
    for (;;) {
      const long size = ::syscall(SYS_getdents64, fd, buffer.data(), buffer.size());
      if (size <= 0) break;
      for (long at = 0; at < size;) {
        const auto* found = reinterpret_cast<const KernelEntry*>(buffer.data() + at);
        at += found->length;
        const std::string_view name(found->name);
        if (name == "." || name == "..") continue;
        entry(fd, found->name);
        if (found->type == DT_DIR) subfolders.emplace_back(name);
      }
    }
    for (const std::string& name : subfolders) {
      const int subfolder =
          ::openat(fd, name.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
      if (subfolder < 0) continue;
      folder(subfolder);
      ::close(subfolder);
    }
  }

 private:
  void entry(int folder, const char* name) {
    ++_entries;
    struct statx status;
    ::statx(folder, name, AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT, STATX_BASIC_STATS | STATX_BTIME,
            &status);
    if (_attributes == 0) return;
    const int fd = ::openat(folder, name, O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC);
    if (fd < 0) return;
    std::array<char, 256> value;
    for (std::size_t index = 0; index < _attributes; ++index) {
      ::fgetxattr(fd, kAttributes[index], value.data(), value.size());
    }
    ::close(fd);
  }

  const std::size_t _attributes;
  long _entries = 0;
};

int usage() {
  std::fputs("usage: floor ROOT look|attribute|record\n", stderr);
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 3) return usage();
  const std::string_view mode(argv[2]);
  if (mode != "look" && mode != "attribute" && mode != "record") return usage();
  const int root = ::open(argv[1], O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (root < 0) {
    std::perror(argv[1]);
    return 1;
  }
  Walk walk(mode == "look" ? 0 : mode == "attribute" ? 1 : kAttributes.size());
  const auto start = std::chrono::steady_clock::now();
  walk.folder(root);
  const std::chrono::duration<double, std::milli> took = std::chrono::steady_clock::now() - start;
  std::printf("{\"entries\": %ld, \"milliseconds\": %.3f}\n", walk.entries(), took.count());
  return 0;
}
