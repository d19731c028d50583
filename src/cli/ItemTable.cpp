#include "cli/ItemTable.h"

#include <fmt/chrono.h>
#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <ctime>
#include <string_view>
#include <vector>

#include "platform/dochost/DochostTags.h"

namespace vantrell::cli {
namespace {

constexpr std::string_view kFolderStyle = "\x1b[1;34m";
constexpr std::string_view kPackageStyle = "\x1b[1;35m";
constexpr std::string_view kLinkStyle = "\x1b[36m";
constexpr std::string_view kFaintStyle = "\x1b[2m";
constexpr std::string_view kPlain = "\x1b[0m";
constexpr std::string_view kSpecialTypes = "inode/";

std::string kindOf(const std::string& type, const TypeRegistry& types) {
  if (type == kFolderTypeIdentifier) return "folder";
  if (type == kSymbolicLinkTypeIdentifier) return "link";
  if (types.typeConformsTo(type, kPackageTypeIdentifier)) return "package";
  // "inode/fifo", "inode/socket", …
  if (type.starts_with(kSpecialTypes)) return type.substr(kSpecialTypes.size());
  return "file";
}

std::string_view styleOf(std::string_view kind) {
  if (kind == "folder") return kFolderStyle;
  if (kind == "package") return kPackageStyle;
  if (kind == "link") return kLinkStyle;
  return "";
}

std::string sizeOf(const DochostItem& item) {
  if (const auto count = item.childItemCount()) {
    return fmt::format("{} {}", *count, *count == 1 ? "item" : "items");
  }
  return item.documentSize() ? textOfByteCount(*item.documentSize()) : "-";
}

std::string localTimeOf(const std::optional<FndDate>& date) {
  if (!date) return "-";
  const std::time_t seconds = date->unixSeconds();
  std::tm local;
  if (::localtime_r(&seconds, &local) == nullptr) return date->description();
  return fmt::format("{:%Y-%m-%d %H:%M}", local);
}

std::string tagsOf(const DochostItem& item) {
  if (!item.tagData()) return "";
  const auto tags = dochostTagsFromData(*item.tagData());
  if (!tags || tags->empty()) return "";
  std::string text;
  for (const DochostTag& tag : *tags) text += (text.empty() ? "" : ", ") + displayText(tag.label);
  return "  [" + text + "]";
}

}  // namespace

struct ItemTable::Row {
  std::string identifier;
  std::string kind;
  std::string size;
  std::string date;
  std::string name;
  std::string tags;
};

std::string ItemTable::linesOf(std::span<const DochostItemRef> page) {
  std::vector<Row> rows;
  rows.reserve(page.size());
  for (const DochostItemRef& item : page) {
    rows.push_back(rowOf(*item));
    _identifierWidth = std::max(_identifierWidth, rows.back().identifier.size());
    _sizeWidth = std::max(_sizeWidth, rows.back().size.size());
  }
  std::string lines;
  for (const Row& row : rows) lines += lineOf(row);
  return lines;
}

ItemTable::Row ItemTable::rowOf(const DochostItem& item) const {
  return {displayText(item.itemIdentifier()),
          kindOf(item.typeIdentifier(), _types),
          sizeOf(item),
          localTimeOf(item.contentModificationDate()),
          displayText(item.filename()),
          tagsOf(item)};
}

std::string ItemTable::lineOf(const Row& row) const {
  constexpr std::size_t kKindWidth = 7;   // "package"
  constexpr std::size_t kDateWidth = 16;  // "2026-11-21 18:53"
  const auto styled = [this](std::string_view style, const std::string& text) {
    return _withColor && !style.empty() && !text.empty()
               ? fmt::format("{}{}{}", style, text, kPlain)
               : text;
  };
  return fmt::format("{:<{}}  {:<{}}  {:>{}}  {:<{}}  {}{}\n", row.identifier, _identifierWidth,
                     row.kind, kKindWidth, row.size, _sizeWidth, row.date, kDateWidth,
                     styled(styleOf(row.kind), row.name), styled(kFaintStyle, row.tags));
}

std::string textOfByteCount(std::uint64_t bytes) {
  constexpr std::array<std::string_view, 6> kUnits = {"kB", "MB", "GB", "TB", "PB", "EB"};
  if (bytes < 1000) return fmt::format("{} B", bytes);
  double value = static_cast<double>(bytes) / 1000;
  std::size_t unit = 0;
  // 999.95 would be shown as 1000.0.
  while (value >= 999.95 && unit + 1 < kUnits.size()) {
    value /= 1000;
    ++unit;
  }
  return fmt::format("{:.1f} {}", value, kUnits[unit]);
}

}  // namespace vantrell::cli
