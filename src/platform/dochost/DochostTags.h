#pragma once

#include <optional>
#include <string>
#include <vector>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"

namespace vantrell {

/// One of the user's tags.
struct DochostTag {
  std::string label;
  std::optional<std::uint64_t> color;  ///< the framework's colour number
  bool operator==(const DochostTag&) const = default;
};

/// The framework's tag data: a keyed archive of a list of dictionaries with the keys "label"
/// and, for a tag that has one, "color". Errors: DamagedData for a label that is not UTF-8.
Result<FndData> dataFromDochostTags(const std::vector<DochostTag>& tags);

/// Errors: DamagedData for anything else than tag data.
Result<std::vector<DochostTag>> dochostTagsFromData(FndDataView data);

}  // namespace vantrell
