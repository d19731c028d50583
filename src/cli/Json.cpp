#include "cli/Json.h"

#include <algorithm>
#include <optional>
#include <utility>
#include <vector>

#include "cli/Base64.h"
#include "platform/dochost/DochostTags.h"
#include "platform/foundation/PosixNames.h"

namespace vantrell::cli {
namespace {

using ErrorHandler = Json::error_handler_t;

std::string dumped(const Json& value, ErrorHandler handler) {
  return value.dump(-1, ' ', false, handler);
}

bool isUTF8(const std::string& bytes) {
  const auto isASCII = [](char c) { return static_cast<unsigned char>(c) < 0x80; };
  if (std::all_of(bytes.begin(), bytes.end(), isASCII)) return true;
  const Json text(bytes);
  return dumped(text, ErrorHandler::replace) == dumped(text, ErrorHandler::ignore);
}

FndDataView viewOf(const std::string& bytes) {
  return {reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size()};
}

template <class Value>
void putIfPresent(Json& object, const char* key, const std::optional<Value>& value) {
  if (value) object[key] = *value;
}

void putIfPresent(Json& object, const char* key, const std::optional<FndDate>& date) {
  if (date) object[key] = date->description();
}

void putIfPresent(Json& object, const char* key, const std::optional<FndURL>& url) {
  if (url) object[key] = url->description();
}

void putTags(Json& object, const std::optional<FndData>& tagData) {
  if (!tagData) return;
  const auto tags = dochostTagsFromData(*tagData);
  if (!tags) return;
  Json labels = Json::array();
  for (const DochostTag& tag : *tags) labels.push_back(tag.label);
  object["tags"] = std::move(labels);
}

using Rows = std::vector<std::pair<std::string, std::string>>;

std::string textOfValue(const Json& value) {
  if (value.is_string()) return displayText(value.get_ref<const std::string&>());
  if (!value.is_array()) return dumped(value, ErrorHandler::replace);
  std::string text;
  for (const Json& element : value) text += (text.empty() ? "" : ", ") + textOfValue(element);
  return text;
}

void addRows(Rows& rows, const std::string& prefix, const Json& object) {
  for (const auto& [key, value] : object.items()) {
    if (key.ends_with("Base64")) continue;  // the escaped text beside it tells people as much
    if (value.is_object()) {
      addRows(rows, prefix + key + ".", value);
    } else {
      rows.emplace_back(prefix + key, textOfValue(value));
    }
  }
}

}  // namespace

void putText(Json& object, std::string_view key, const std::string& bytes) {
  object[std::string(key)] = bytes;
  if (!isUTF8(bytes)) object[std::string(key) + "Base64"] = base64(viewOf(bytes));
}

Json recordOfItem(const DochostItem& item) {
  Json record;
  record["itemIdentifier"] = item.itemIdentifier();
  record["parentItemIdentifier"] = item.parentItemIdentifier();
  putText(record, "filename", item.filename());
  record["typeIdentifier"] = item.typeIdentifier();
  putIfPresent(record, "documentSize", item.documentSize());
  putIfPresent(record, "creationDate", item.creationDate());
  putIfPresent(record, "contentModificationDate", item.contentModificationDate());
  putIfPresent(record, "childItemCount", item.childItemCount());
  record["capabilities"] = item.capabilities();
  if (item.versionIdentifier()) record["versionIdentifier"] = base64(*item.versionIdentifier());
  record["isTrashed"] = item.isTrashed();
  putIfPresent(record, "lastUsedDate", item.lastUsedDate());
  putTags(record, item.tagData());
  putIfPresent(record, "favoriteRank", item.favoriteRank());
  if (item.fileID()) record["fileID"] = item.fileID()->value;
  if (item.docID()) record["docID"] = item.docID()->value;
  record["fileURL"] = item.fileURL().description();
  putIfPresent(record, "dh_lumenDomainIdentifier", item.dh_lumenDomainIdentifier());
  putIfPresent(record, "dh_appContainerBundleIdentifier", item.dh_appContainerBundleIdentifier());
  record["dh_isUbiquitous"] = item.dh_isUbiquitous();
  if (item.isTrashed()) putIfPresent(record, "putBackURL", item.putBackURL());
  return record;
}

Json recordOfError(const FndError& error) {
  Json record;
  record["domain"] = error.domain();
  record["code"] = error.code();
  if (error.domain() == kFndPOSIXErrorDomain) {
    const std::string_view name = posixErrorName(static_cast<int>(error.code()));
    if (!name.empty()) record["name"] = std::string(name);
  }
  record["message"] = error.message();
  return record;
}

std::string lineOf(const Json& object) { return dumped(object, ErrorHandler::replace) + "\n"; }

std::string tableOf(const Json& object) {
  Rows rows;
  addRows(rows, "", object);
  std::size_t width = 0;
  for (const auto& [key, value] : rows) width = std::max(width, key.size());
  std::string text;
  for (const auto& [key, value] : rows) {
    text += key + std::string(width - key.size() + 2, ' ') + value + "\n";
  }
  return text;
}

}  // namespace vantrell::cli
