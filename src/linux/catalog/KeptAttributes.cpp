#include "linux/catalog/KeptAttributes.h"

#include <sys/xattr.h>

#include <cerrno>
#include <string_view>

#include "linux/catalog/FileIndex.h"

namespace vantrell::linuxos::catalog {

namespace {

// Where Linux keeps what programs may set; the names in the catalog are without it.
constexpr std::string_view kNamespace = "user.";

std::string descriptorPath(int descriptor) { return "/proc/self/fd/" + std::to_string(descriptor); }

/// All names, each ending in NUL. The list may grow between two calls, hence the loop.
std::optional<std::string> listOf(const std::string& path) {
  std::string names(1024, '\0');
  for (;;) {
    const ssize_t size = ::llistxattr(path.c_str(), names.data(), names.size());
    const int osError = errno;
    if (size >= 0) {
      names.resize(static_cast<std::size_t>(size));
      return names;
    }
    if (osError != ERANGE) return std::nullopt;
    names.resize(names.size() * 4);
  }
}

std::optional<FndData> valueOf(const std::string& path, const std::string& name) {
  FndData value(256);
  for (;;) {
    const ssize_t size = ::lgetxattr(path.c_str(), name.c_str(), value.data(), value.size());
    const int osError = errno;
    if (size >= 0) {
      value.resize(static_cast<std::size_t>(size));
      return value;
    }
    if (osError != ERANGE) return std::nullopt;
    value.resize(value.size() * 4);
  }
}

}  // namespace

std::optional<std::vector<Attribute>> readKeptAttributes(int folder, const std::string& name) {
  const std::string path = descriptorPath(folder) + "/" + name;
  const auto names = listOf(path);
  if (!names) return std::nullopt;
  std::vector<Attribute> attributes;
  for (std::size_t at = 0; at < names->size();) {
    const std::string full(names->c_str() + at);
    at += full.size() + 1;
    if (!full.starts_with(kNamespace)) continue;
    const std::string exact = full.substr(kNamespace.size());
    if (!isKeptAcrossSafeSave(exact)) continue;
    auto value = valueOf(path, full);
    if (value) attributes.push_back({exact, std::move(*value)});
  }
  return attributes;
}

OsResult<void> setMissingAttributes(int descriptor, const std::vector<Attribute>& attributes) {
  const std::string path = descriptorPath(descriptor);
  int firstError = 0;
  for (const Attribute& attribute : attributes) {
    const std::string name = std::string(kNamespace) + attribute.name;
    // Through /proc, because attributes cannot be set on a descriptor that was opened with
    // O_PATH; created only, so that what the application has set itself stays.
    const int failed = ::setxattr(path.c_str(), name.c_str(), attribute.value.data(),
                                  attribute.value.size(), XATTR_CREATE);
    const int osError = errno;
    if (failed != 0 && osError != EEXIST && firstError == 0) firstError = osError;
  }
  if (firstError != 0) return std::unexpected(firstError);
  return {};
}

}  // namespace vantrell::linuxos::catalog
