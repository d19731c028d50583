#include "TestStorage.h"

#include <fcntl.h>
#include <linux/fs.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "linux/FileDescriptor.h"

namespace vantrell::properties {
namespace {

void require(bool holds, const std::string& what) {
  if (holds) return;
  std::perror(shown("the test itself failed at " + what).c_str());
  std::abort();
}

std::string makeTemporaryFolder(const std::string& parent) {
  std::string pattern = parent + "/vantrell-properties-XXXXXX";
  require(::mkdtemp(pattern.data()) != nullptr, pattern);
  return std::filesystem::canonical(pattern);
}

void writeAll(int fd, std::string_view content, const std::string& path) {
  require(::write(fd, content.data(), content.size()) == static_cast<ssize_t>(content.size()),
          path);
}

}  // namespace

std::string TestStorage::defaultParent() { return std::filesystem::temp_directory_path(); }

TestStorage::TestStorage(const std::string& parent, const std::string& stateParent)
    : _base(makeTemporaryFolder(parent)), _stateBase(makeTemporaryFolder(stateParent)) {
  _root = _base + "/storage";
  _outside = _base + "/outside";
  _state = _stateBase + "/state";
  for (const std::string& folder : {_root, _outside, _state}) {
    require(::mkdir(folder.c_str(), 0700) == 0, folder);
  }
  made(_root);
  made(_outside);
}

TestStorage::~TestStorage() {
  std::error_code ignored;
  std::filesystem::remove_all(_base, ignored);
  std::filesystem::remove_all(_stateBase, ignored);
}

std::string TestStorage::relative(const std::string& path) const {
  return shown(std::string_view(path).substr(_base.size() + 1));
}

void TestStorage::made(const std::string& path) {
  if (!_registry.made(path)) return;
  ++_reusedFileNumbers;
  note("  (its file number had been another object's)");
}

void TestStorage::write(const std::string& path, std::string_view content, int flags) {
  const linuxos::FileDescriptor file(::open(path.c_str(), flags | O_WRONLY | O_CLOEXEC, 0600));
  require(static_cast<bool>(file), path);
  writeAll(file.get(), content, path);
}

void TestStorage::createFile(const std::string& path, std::string_view content) {
  note("create " + relative(path));
  write(path, content, O_CREAT | O_EXCL);
  made(path);
}

void TestStorage::createFolder(const std::string& path) {
  note("mkdir " + relative(path));
  require(::mkdir(path.c_str(), 0700) == 0, path);
  made(path);
}

void TestStorage::createPackage(const std::string& path) {
  note("create package " + relative(path));
  require(::mkdir(path.c_str(), 0700) == 0, path);
  require(::mkdir((path + "/assets").c_str(), 0700) == 0, path);
  write(path + "/index", "index", O_CREAT);
  write(path + "/assets/picture", "picture", O_CREAT);
  made(path);
}

void TestStorage::createLink(const std::string& path, const std::string& target) {
  note("symlink " + relative(path));
  require(::symlink(target.c_str(), path.c_str()) == 0, path);
  made(path);
}

void TestStorage::createFifo(const std::string& path) {
  note("mkfifo " + relative(path));
  require(::mkfifo(path.c_str(), 0600) == 0, path);
  made(path);
}

void TestStorage::append(const std::string& path, std::string_view content) {
  note("append to " + relative(path));
  write(path, content, O_APPEND);
}

bool TestStorage::moveToFreeName(const std::string& from, const std::string& to) {
  if (::renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) != 0) {
    return false;
  }
  note("mv -n " + relative(from) + " " + relative(to));
  return true;
}

bool TestStorage::moveOver(const std::string& from, const std::string& to) {
  if (::rename(from.c_str(), to.c_str()) != 0) return false;
  note("mv " + relative(from) + " " + relative(to));
  return true;
}

bool TestStorage::exchange(const std::string& one, const std::string& other) {
  if (::renameat2(AT_FDCWD, one.c_str(), AT_FDCWD, other.c_str(), RENAME_EXCHANGE) != 0) {
    return false;
  }
  note("exchange " + relative(one) + " " + relative(other));
  return true;
}

bool TestStorage::hardLink(const std::string& from, const std::string& to) {
  if (::link(from.c_str(), to.c_str()) != 0) return false;
  note("ln " + relative(from) + " " + relative(to));
  return true;
}

void TestStorage::createUnnamedThenLink(const std::string& path, std::string_view content) {
  note("write without a name, then link to " + relative(path));
  const std::string folder = path.substr(0, path.rfind('/'));
  const linuxos::FileDescriptor file(
      ::open(folder.c_str(), O_TMPFILE | O_WRONLY | O_CLOEXEC, 0600));
  require(static_cast<bool>(file), folder);
  writeAll(file.get(), content, path);
  const std::string unnamed = "/proc/self/fd/" + std::to_string(file.get());
  require(::linkat(AT_FDCWD, unnamed.c_str(), AT_FDCWD, path.c_str(), AT_SYMLINK_FOLLOW) == 0,
          path);
  made(path);
}

void TestStorage::remove(const std::string& path) {
  note("rm -r " + relative(path));
  std::filesystem::remove_all(path);
}

void TestStorage::copy(const std::string& from, const std::string& to, bool withAttributes) {
  note((withAttributes ? "cp -a " : "cp -r ") + relative(from) + " " + relative(to));
  namespace fs = std::filesystem;
  // What is neither file nor folder is left out, and so is what comes after it.
  std::error_code refused;
  fs::copy(from, to, fs::copy_options::recursive | fs::copy_options::copy_symlinks, refused);
  made(to);
  if (!withAttributes) return;
  for (const auto& [name, value] : readAttributes(from)) {
    require(::lsetxattr(to.c_str(), ("user." + name).c_str(), value.data(), value.size(), 0) == 0,
            to);
  }
}

void TestStorage::setAttribute(const std::string& path, const std::string& name,
                               std::string_view value) {
  note("set " + name + " of " + relative(path) + " to " + std::string(value));
  require(::lsetxattr(path.c_str(), ("user." + name).c_str(), value.data(), value.size(), 0) == 0,
          path);
}

void TestStorage::removeAttribute(const std::string& path, const std::string& name) {
  if (::lremovexattr(path.c_str(), ("user." + name).c_str()) == 0) {
    note("remove " + name + " of " + relative(path));
  }
}

}  // namespace vantrell::properties
