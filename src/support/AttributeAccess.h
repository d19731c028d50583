#pragma once

#include <optional>
#include <string_view>

#include "platform/filesystem/OpenFile.h"
#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// The value of an extended attribute of the object at `url`, a final link not followed. None
/// when there is no such attribute (which is not logged), and when it cannot be read (which is).
///
/// Threads: any.
std::optional<FndData> initWithValueOfXattr_at(std::string_view name, const FndURL& url);

/// Sets the attribute to `value`, or removes it when there is none; one that is not there is
/// removed already. Errors, logged: POSIX.
///
/// Threads: as `file`.
Result<void> setOrRemoveXattr(OpenFile& file, std::string_view name,
                              std::optional<FndDataView> value);

}  // namespace vantrell
