#include "tests/contracts/TemporaryFolder.h"

#include <fcntl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <array>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <vector>

namespace vantrell::testing {
namespace {

namespace fs = std::filesystem;
constexpr uid_t kNobody = 65534;

void check(bool works, const std::string& what) {
  if (!works) throw std::runtime_error(what + ": " + std::strerror(errno));
}

// Brings every folder to the top before it is emptied, so that no path grows long.
void removeTree(const fs::path& root) {
  std::error_code ignored;
  int serial = 0;
  std::vector<fs::path> folders = {root};
  while (!folders.empty()) {
    const fs::path folder = folders.back();
    folders.pop_back();
    fs::permissions(folder, fs::perms::owner_all, ignored);
    for (const fs::directory_entry& entry : fs::directory_iterator(folder, ignored)) {
      const bool isFolder = entry.is_directory(ignored) && !entry.is_symlink(ignored);
      if (!isFolder) {
        fs::remove(entry.path(), ignored);
        continue;
      }
      fs::permissions(entry.path(), fs::perms::owner_all, ignored);
      const fs::path top = root.string() + "." + std::to_string(serial++);
      fs::rename(entry.path(), top, ignored);
      folders.push_back(top);
    }
    fs::remove(folder, ignored);
  }
}

}  // namespace

TemporaryFolder::TemporaryFolder() {
  std::string pattern = (fs::canonical(fs::temp_directory_path()) / "vantrell-XXXXXX").string();
  check(::mkdtemp(pattern.data()) != nullptr, "mkdtemp");
  _path = pattern;
  check(::chmod(_path.c_str(), 0777) == 0, "chmod");  // an ordinary user works here, too
}

TemporaryFolder::~TemporaryFolder() { removeTree(_path); }

std::string TemporaryFolder::path(std::string_view name) const {
  return _path + "/" + std::string(name);
}

std::string TemporaryFolder::makeFolder(std::string_view name) const {
  check(::mkdir(path(name).c_str(), 0755) == 0, "mkdir");
  return path(name);
}

std::string TemporaryFolder::writeFile(std::string_view name, std::string_view bytes) const {
  std::ofstream file(path(name), std::ios::binary | std::ios::trunc);
  file << bytes;
  file.close();
  check(file.good(), "write");
  return path(name);
}

std::string TemporaryFolder::makeLink(std::string_view name, const std::string& target) const {
  check(::symlink(target.c_str(), path(name).c_str()) == 0, "symlink");
  return path(name);
}

std::string TemporaryFolder::makeFifo(std::string_view name) const {
  check(::mkfifo(path(name).c_str(), 0644) == 0, "mkfifo");
  return path(name);
}

std::string TemporaryFolder::makeSocket(std::string_view name) const {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  const std::string where = path(name);
  check(where.size() < sizeof address.sun_path, "the temporary folder's path is too long");
  std::memcpy(address.sun_path, where.data(), where.size());
  const int fd = ::socket(AF_UNIX, SOCK_STREAM, 0);
  check(fd >= 0, "socket");
  check(::bind(fd, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0, "bind");
  ::close(fd);
  return where;
}

AsOrdinaryUser::AsOrdinaryUser() : _wasRoot(::geteuid() == 0) {
  if (!_wasRoot) return;
  check(::setegid(kNobody) == 0 && ::seteuid(kNobody) == 0, "seteuid");
}

AsOrdinaryUser::~AsOrdinaryUser() {
  if (!_wasRoot) return;
  if (::seteuid(0) != 0 || ::setegid(0) != 0) std::abort();
}

std::string rawAttribute(const std::string& path, const std::string& fullName) {
  std::array<char, 65536> buffer;
  const ssize_t size = ::lgetxattr(path.c_str(), fullName.c_str(), buffer.data(), buffer.size());
  return size < 0 ? "(none)" : std::string(buffer.data(), static_cast<std::size_t>(size));
}

}  // namespace vantrell::testing
