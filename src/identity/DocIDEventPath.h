#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "platform/foundation/Identifiers.h"

namespace vantrell {

/// What an event path "/.docid/$dev/changed/$docid/src=$src,dst=$dst" says: which file stood for
/// a document before, and which one does now (0: the document is gone).
struct DocIDEvent {
  DeviceID device;
  DocumentID documentID;
  FileID source;
  FileID destination;
  bool operator==(const DocIDEvent&) const = default;
};

/// Reads such a path: exactly that form, with unsigned decimal numbers that fit. None for
/// anything else.
///
/// Threads: any.
std::optional<DocIDEvent> parseDocIDEventPath(std::string_view path);

}  // namespace vantrell
