#include "linux/types/KeyFile.h"

#include <algorithm>

#include "linux/types/MimeFiles.h"

namespace vantrell::linuxos {
namespace {

std::string_view trimmed(std::string_view text) {
  constexpr std::string_view kSpace = " \t\r";
  const std::size_t first = text.find_first_not_of(kSpace);
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(kSpace) - first + 1);
}

void takeLine(std::vector<KeyFileSection>& sections, std::string_view line) {
  line = trimmed(line);
  if (line.starts_with('[')) {
    const std::size_t close = line.find(']');
    if (close != std::string_view::npos) {
      sections.push_back({std::string(line.substr(1, close - 1)), {}});
    }
    return;
  }
  const std::size_t equals = line.find('=');
  if (sections.empty() || equals == std::string_view::npos || equals == 0) return;
  sections.back().entries.emplace_back(trimmed(line.substr(0, equals)),
                                       trimmed(line.substr(equals + 1)));
}

}  // namespace

std::optional<std::string_view> KeyFileSection::value(std::string_view key) const {
  for (const auto& [known, value] : entries) {
    if (known == key) return value;
  }
  return std::nullopt;
}

std::vector<KeyFileSection> readKeyFile(const std::string& path) {
  std::vector<KeyFileSection> sections;
  forEachLine(path, [&sections](std::string_view line) { takeLine(sections, line); });
  return sections;
}

std::vector<std::string_view> keyFileList(std::string_view value) {
  std::vector<std::string_view> parts;
  while (!value.empty()) {
    const std::size_t end = std::min(value.find(';'), value.size());
    const std::string_view part = trimmed(value.substr(0, end));
    if (!part.empty()) parts.push_back(part);
    value.remove_prefix(std::min(end + 1, value.size()));
  }
  return parts;
}

}  // namespace vantrell::linuxos
