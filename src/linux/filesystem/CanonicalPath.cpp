#include "linux/filesystem/CanonicalPath.h"

#include <fcntl.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <climits>
#include <optional>
#include <string_view>
#include <vector>

namespace vantrell::linuxos {
namespace {

constexpr int kMostLinks = 40;  // the kernel's own bound
constexpr int kFolder = O_PATH | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC;

// Follows a path component by component, and what links say in between.
class Resolver {
 public:
  // The folder that `path` leads to, links followed.
  OsResult<std::string> folder(std::string_view path) {
    expect(path);
    if (const int osError = goToRoot()) return std::unexpected(osError);
    while (!_ahead.empty()) {
      const std::string component = std::move(_ahead.back());
      _ahead.pop_back();
      if (const int osError = step(component)) return std::unexpected(osError);
    }
    return _reached.empty() ? "/" : _reached;
  }

 private:
  // Puts the components of `path` before those that are still to be walked.
  void expect(std::string_view path) {
    while (!path.empty()) {
      const std::size_t slash = path.rfind('/');
      const std::size_t start = slash == std::string_view::npos ? 0 : slash + 1;
      const std::string_view component = path.substr(start);
      if (!component.empty() && component != ".") _ahead.emplace_back(component);
      path = path.substr(0, slash == std::string_view::npos ? 0 : slash);
    }
  }

  int goToRoot() {
    _reached.clear();
    return goTo("/");
  }

  int goTo(std::string_view path) {
    auto opened = openWithoutLinks(AT_FDCWD, path, kFolder);
    if (!opened) return opened.error();
    _folder = std::move(*opened);
    return 0;
  }

  int step(const std::string& component) {
    if (component == "..") return stepUp();
    FileDescriptor below(::openat(_folder.get(), component.c_str(), kFolder));
    const int osError = errno;
    if (below) {
      _folder = std::move(below);
      _reached += '/';
      _reached += component;
      return 0;
    }
    return osError == ENOTDIR || osError == ELOOP ? followLink(component) : osError;
  }

  // What has been reached holds no links, so that its text alone says where its folder is.
  int stepUp() {
    if (_reached.empty()) return 0;
    _reached.resize(_reached.rfind('/'));
    return goTo(_reached.empty() ? "/" : _reached);
  }

  int followLink(const std::string& component) {
    if (++_links > kMostLinks) return ELOOP;
    std::array<char, PATH_MAX> target;
    const ssize_t size =
        ::readlinkat(_folder.get(), component.c_str(), target.data(), target.size());
    const int osError = errno;
    if (size < 0) return osError == EINVAL ? ENOTDIR : osError;  // no link after all
    const std::string_view text(target.data(), static_cast<std::size_t>(size));
    expect(text);
    return text.starts_with('/') ? goToRoot() : 0;
  }

  std::vector<std::string> _ahead;  // components still to be walked, the next one last
  std::string _reached;             // without links; empty for the root
  FileDescriptor _folder;           // what `_reached` names
  int _links = 0;
};

}  // namespace

OsResult<std::string> canonicalPath(const std::string& path) {
  if (path.find('\0') != std::string::npos) return std::unexpected(EINVAL);
  const std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) return std::unexpected(EINVAL);
  const std::string name = path.substr(slash + 1);
  if (name.empty() || name == "..") return Resolver().folder(path);
  auto folder = Resolver().folder(std::string_view(path).substr(0, slash));
  if (!folder) return folder;
  if (*folder == "/") folder->clear();
  return *folder + '/' + name;
}

}  // namespace vantrell::linuxos
