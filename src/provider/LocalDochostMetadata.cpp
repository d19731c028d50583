// The metadata setters: last-used date, tags, favourite rank.

#include <utility>

#include "items/ItemMetadata.h"
#include "provider/LocalDochost.h"
#include "support/Log.h"
#include "support/TracedSection.h"

namespace vantrell {
namespace {

std::optional<FndError> errorOf(const Result<void>& result) {
  return result ? std::nullopt : std::optional(result.error());
}

std::string lastUsedText(const std::optional<FndDate>& date, std::string_view identifier) {
  std::string text = date ? "set last used date \"" + date->description() + "\" to item \""
                          : "clearing last used date for item \"";
  return text.append(identifier).append("\"");
}

// The labels are all that is kept of tag data.
Result<void> writeTags(const FndURL& url, const std::optional<FndData>& tagData) {
  if (!tagData) return writeMetadata(url, kTagsAttribute, std::nullopt);
  Result<ArchiveValue> labels = tagLabelsFromTagData(*tagData);
  if (!labels) return std::unexpected(std::move(labels.error()));
  return writeMetadata(url, kTagsAttribute, std::move(*labels));
}

}  // namespace

void LocalDochost::setLastUsedDate_forItemIdentifier_completionHandler(std::optional<FndDate> date,
                                                                       std::string_view identifier,
                                                                       ItemCompletion completion) {
  const TracedSection section([&] { return lastUsedText(date, identifier); });
  const Result<FndURL> url = urlForItemIdentifier(identifier);
  if (!url) return completion(nullptr, url.error());
  // Nobody waits for this date: a write that fails has been logged, and that is all.
  static_cast<void>(writeMetadata(*url, kLastUsedDateAttribute,
                                  date ? std::optional(ArchiveValue(*date)) : std::nullopt));
  completeWithFreshItem(identifier, std::nullopt, std::move(completion));
}

void LocalDochost::setTagData_forItemIdentifier_completionHandler(std::optional<FndData> tagData,
                                                                  std::string_view identifier,
                                                                  ItemCompletion completion) {
  const TracedSection section("set tag data to item \"", identifier, "\"");
  const Result<FndURL> url = urlForItemIdentifier(identifier);
  if (!url) {
    logError("can't find URL for item; ", identifier);
    return completion(nullptr, url.error());
  }
  completeWithFreshItem(identifier, errorOf(writeTags(*url, tagData)), std::move(completion));
}

void LocalDochost::setFavoriteRank_forItemIdentifier_completionHandler(
    std::optional<std::uint64_t> rank, std::string_view identifier, ItemCompletion completion) {
  const TracedSection section(
      "set favorite rank \"", [&] { return rank ? std::to_string(*rank) : std::string("nil"); },
      "\" to item \"", identifier, "\"");
  const Result<FndURL> url = urlForItemIdentifier(identifier);
  if (!url) return completion(nullptr, url.error());
  const auto value = rank ? std::optional(ArchiveValue(FndNumber(*rank))) : std::nullopt;
  const Result<void> written = writeMetadata(*url, kFavoriteRankAttribute, value);
  completeWithFreshItem(identifier, errorOf(written), std::move(completion));
}

void LocalDochost::completeWithFreshItem(std::string_view identifier, std::optional<FndError> error,
                                         ItemCompletion completion) {
  Result<DochostItemRef> item = itemForIdentifier_error(identifier);
  if (!item) return completion(nullptr, std::move(item.error()));
  completion(std::move(*item), std::move(error));
}

}  // namespace vantrell
