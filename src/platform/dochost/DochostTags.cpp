#include "platform/dochost/DochostTags.h"

#include <string_view>
#include <utility>

#include "platform/archive/KeyedArchive.h"

namespace vantrell {
namespace {

constexpr std::string_view kLabelKey = "label";
constexpr std::string_view kColorKey = "color";

// The tag in one element of the list; none when it is something else.
std::optional<DochostTag> tagFromValue(const ArchiveValue& value) {
  const auto* fields = value.dictionary();
  if (fields == nullptr) return std::nullopt;
  const auto label = fields->find(kLabelKey);
  if (label == fields->end() || label->second.string() == nullptr) return std::nullopt;
  DochostTag tag{*label->second.string(), std::nullopt};
  const auto color = fields->find(kColorKey);
  if (color != fields->end() && color->second.number() != nullptr) {
    tag.color = color->second.number()->exactUInt64();
  }
  return tag;
}

}  // namespace

Result<FndData> dataFromDochostTags(const std::vector<DochostTag>& tags) {
  ArchiveValue::List list;
  list.reserve(tags.size());
  for (const DochostTag& tag : tags) {
    ArchiveValue::Dictionary fields;
    fields.emplace(kLabelKey, ArchiveValue(tag.label));
    if (tag.color) fields.emplace(kColorKey, ArchiveValue(FndNumber(*tag.color)));
    list.emplace_back(std::move(fields));
  }
  return archivedDataWithRootObject(ArchiveValue(std::move(list)));
}

Result<std::vector<DochostTag>> dochostTagsFromData(FndDataView data) {
  auto root = unarchivedObjectOfClasses(data, {ArchiveClass::List, ArchiveClass::Dictionary,
                                               ArchiveClass::String, ArchiveClass::Number});
  if (!root) return std::unexpected(std::move(root.error()));
  const auto notTags = [] {
    return std::unexpected(
        FndError::vantrell(VantrellErrorCode::DamagedData, "The data holds no list of tags."));
  };
  if (root->list() == nullptr) return notTags();
  std::vector<DochostTag> tags;
  for (const ArchiveValue& element : *root->list()) {
    auto tag = tagFromValue(element);
    if (!tag) return notTags();
    tags.push_back(std::move(*tag));
  }
  return tags;
}

}  // namespace vantrell
