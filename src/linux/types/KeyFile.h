#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace vantrell::linuxos {

/// A file of sections with keys and values:
///
///     # a comment
///     [section]
///     key=value
///
/// White space around keys and values does not count. Of two keys of one name in a section the
/// first counts. What cannot be made out is passed over.
struct KeyFileSection {
  std::string name;
  std::vector<std::pair<std::string, std::string>> entries;

  std::optional<std::string_view> value(std::string_view key) const;
};

/// The sections in their order; none for a file that cannot be read.
std::vector<KeyFileSection> readKeyFile(const std::string& path);

/// The parts of "a;b;c;", without white space around them and without empty ones.
std::vector<std::string_view> keyFileList(std::string_view value);

}  // namespace vantrell::linuxos
