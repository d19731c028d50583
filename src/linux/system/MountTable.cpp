#include "linux/system/MountTable.h"

#include <algorithm>
#include <fstream>
#include <iterator>

namespace vantrell::linuxos {
namespace {

// One line: "36 35 98:0 /root /mount/point options fields - type source options", where there are
// any number of optional fields, and blanks in a path are written "\040".
constexpr std::size_t kMountPointField = 4;
constexpr std::string_view kEndOfOptionalFields = " - ";

std::string_view wordAt(std::string_view line, std::size_t index) {
  for (; index > 0; --index) {
    line.remove_prefix(std::min(line.find(' ') + 1, line.size()));
  }
  return line.substr(0, line.find(' '));
}

bool isOctalDigit(char c) { return c >= '0' && c <= '7'; }

std::string unescaped(std::string_view text) {
  std::string bytes;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool escape = text[i] == '\\' && i + 3 < text.size() && isOctalDigit(text[i + 1]) &&
                        isOctalDigit(text[i + 2]) && isOctalDigit(text[i + 3]);
    if (!escape) {
      bytes += text[i];
      continue;
    }
    const int value = (text[i + 1] - '0') * 64 + (text[i + 2] - '0') * 8 + (text[i + 3] - '0');
    bytes += static_cast<char>(value);
    i += 3;
  }
  return bytes;
}

bool liesBelow(std::string_view path, std::string_view mountPoint) {
  if (mountPoint == "/") return true;
  if (!path.starts_with(mountPoint)) return false;
  return path.size() == mountPoint.size() || path[mountPoint.size()] == '/';
}

}  // namespace

std::string fileSystemTypeInMountTable(std::string_view mountTable, std::string_view path) {
  std::string type;
  std::size_t longest = 0;
  while (!mountTable.empty()) {
    const std::size_t end = std::min(mountTable.find('\n'), mountTable.size());
    const std::string_view line = mountTable.substr(0, end);
    mountTable.remove_prefix(std::min(end + 1, mountTable.size()));
    const std::size_t separator = line.find(kEndOfOptionalFields);
    if (separator == std::string_view::npos) continue;
    const std::string mountPoint = unescaped(wordAt(line, kMountPointField));
    // Of two mounts on one point the later one hides the earlier.
    if (mountPoint.empty() || mountPoint.size() < longest || !liesBelow(path, mountPoint)) continue;
    longest = mountPoint.size();
    type = wordAt(line.substr(separator + kEndOfOptionalFields.size()), 0);
  }
  return type;
}

std::string fileSystemTypeOfPath(std::string_view path) {
  std::ifstream file("/proc/self/mountinfo", std::ios::binary);
  const std::string table{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  return fileSystemTypeInMountTable(table, path);
}

}  // namespace vantrell::linuxos
