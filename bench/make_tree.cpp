// Makes a tree of documents to measure on: make_tree ROOT FOLDERS FILES_PER_FOLDER
//
// Folders are ten wide at each level until there are enough; every file has 512 bytes. What is
// there already is kept, so that a second run costs little.

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <deque>
#include <string>

namespace {

[[noreturn]] void fail(const std::string& path) {
  std::perror(path.c_str());
  std::exit(1);
}

void makeFolder(const std::string& path) {
  if (::mkdir(path.c_str(), 0755) != 0 && errno != EEXIST) fail(path);
}

void makeFile(const std::string& path) {
  static constexpr std::array<char, 512> kContent = [] {
    std::array<char, 512> content{};
    content.fill('x');
    return content;
  }();
  const int fd = ::open(path.c_str(), O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC, 0644);
  if (fd < 0 && errno == EEXIST) return;
  if (fd < 0) fail(path);
  if (::write(fd, kContent.data(), kContent.size()) != static_cast<ssize_t>(kContent.size())) {
    fail(path);
  }
  if (::close(fd) != 0) fail(path);
}

void fillFolder(const std::string& path, long files) {
  for (long index = 0; index < files; ++index) {
    std::array<char, 48> name{};
    std::snprintf(name.data(), name.size(), "/Document %06ld.txt", index);
    makeFile(path + name.data());
  }
}

void makeTree(const std::string& root, long folders, long filesPerFolder) {
  makeFolder(root);
  std::deque<std::string> parents{root};
  for (long made = 0; made < folders; parents.pop_front()) {
    for (int child = 0; child < 10 && made < folders; ++child, ++made) {
      parents.push_back(parents.front() + "/Folder " + std::to_string(child));
      makeFolder(parents.back());
      fillFolder(parents.back(), filesPerFolder);
    }
  }
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 4) {
    std::fputs("usage: make_tree ROOT FOLDERS FILES_PER_FOLDER\n", stderr);
    return 2;
  }
  makeTree(argv[1], std::strtol(argv[2], nullptr, 10), std::strtol(argv[3], nullptr, 10));
  return 0;
}
