#pragma once

#include <initializer_list>
#include <optional>
#include <string_view>

#include "platform/archive/KeyedArchive.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// The error of an archive that decodes, but not to what was asked for. Its userInfo carries two
/// class names as strings, "expected" and "actual".
FndError invalidResultingClass(std::string_view expected, std::string_view actual);

/// The object in the keyed archive `data`, when it is an `expected` one and holds nothing but
/// that and the classes of `within`. None otherwise; then an error line names `source`, where
/// the data came from, and a debug line the reason.
///
/// Threads: any.
std::optional<ArchiveValue> unarchivedObject(FndDataView data, ArchiveClass expected,
                                             const FndURL& source);
std::optional<ArchiveValue> unarchivedObject(FndDataView data, ArchiveClass expected,
                                             ArchiveClass within, const FndURL& source);

}  // namespace vantrell
