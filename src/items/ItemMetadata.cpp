#include "items/ItemMetadata.h"

#include <cerrno>
#include <utility>
#include <vector>

#include "platform/dochost/DhURLOperations.h"
#include "platform/dochost/DochostTags.h"
#include "support/AttributeAccess.h"
#include "support/Errors.h"
#include "support/KeyedUnarchiving.h"
#include "support/Log.h"

namespace vantrell {
namespace {

std::optional<ArchiveValue> readObject(std::string_view attribute, const FndURL& url,
                                       ArchiveClass expected, ArchiveClass within) {
  const std::optional<FndData> data = initWithValueOfXattr_at(attribute, url);
  return data ? unarchivedObject(*data, expected, within, url) : std::nullopt;
}

std::optional<FndDate> readDate(std::string_view attribute, const FndURL& url) {
  const auto value = readObject(attribute, url, ArchiveClass::Date, ArchiveClass::Date);
  return value ? std::optional(*value->date()) : std::nullopt;
}

Result<void> writeAttribute(const FndURL& url, std::string_view attribute,
                            const std::optional<ArchiveValue>& value) {
  std::optional<FndData> archived;
  if (value) {
    Result<FndData> data = archivedDataWithRootObject(*value);
    if (!data) return std::unexpected(errorWithPOSIXCode(EINVAL));
    archived = std::move(*data);
  }
  return dh_withReadWriteAccess(url, [&](OpenFile& file) {
    return setOrRemoveXattr(file, attribute,
                            archived ? std::optional<FndDataView>(*archived) : std::nullopt);
  });
}

}  // namespace

std::optional<FndDate> readLastUsedDate(const FndURL& url) {
  return readDate(kLastUsedDateAttribute, url);
}

std::optional<FndData> readTagData(const FndURL& url) {
  const auto value = readObject(kTagsAttribute, url, ArchiveClass::List, ArchiveClass::String);
  if (!value) return std::nullopt;
  std::vector<DochostTag> tags;
  tags.reserve(value->list()->size());
  for (const ArchiveValue& label : *value->list()) {
    if (label.string() == nullptr) return std::nullopt;  // a list in the list
    tags.push_back({*label.string(), std::nullopt});
  }
  Result<FndData> data = dataFromDochostTags(tags);
  return data ? std::optional(std::move(*data)) : std::nullopt;
}

std::optional<std::uint64_t> readFavoriteRank(const FndURL& url) {
  const auto value =
      readObject(kFavoriteRankAttribute, url, ArchiveClass::Number, ArchiveClass::Number);
  return value ? value->number()->exactUInt64() : std::nullopt;
}

std::optional<FndDate> readTrashTime(const FndURL& url) {
  return readDate(kTrashTimeAttribute, url);
}

std::optional<std::string> readPutBackLocation(const FndURL& url) {
  const auto value = readObject(kPutBackAttribute, url, ArchiveClass::String, ArchiveClass::String);
  return value ? std::optional(*value->string()) : std::nullopt;
}

Result<ArchiveValue> tagLabelsFromTagData(FndDataView tagData) {
  const Result<std::vector<DochostTag>> tags = dochostTagsFromData(tagData);
  if (!tags) return std::unexpected(tags.error());
  ArchiveValue::List labels;
  labels.reserve(tags->size());
  for (const DochostTag& tag : *tags) labels.emplace_back(tag.label);
  return ArchiveValue(std::move(labels));
}

Result<void> writeMetadata(const FndURL& url, std::string_view attribute,
                           const std::optional<ArchiveValue>& value) {
  const Result<void> written = writeAttribute(url, attribute, value);
  if (written) return {};
  FndError error = errorWithPOSIXCode(posixCodeOfError(written.error()));
  logError("can't ", value ? "set" : "remove", " xattr ", attribute, " on ", url, "; ", error);
  return std::unexpected(std::move(error));
}

}  // namespace vantrell
