#pragma once

#include <cstddef>
#include <expected>
#include <optional>
#include <string>
#include <string_view>

#include "platform/foundation/FndData.h"

namespace vantrell {

/// The length of the well-formed UTF-8 sequence at the front of `bytes`: 1 to 4, and 0 when there
/// is none. `bytes` must not be empty.
std::size_t utf8SequenceLength(std::string_view bytes);

/// `text` in UTF-16, big-endian. None when it is not well-formed UTF-8.
std::optional<FndData> utf16FromUTF8(std::string_view text);

/// Big-endian UTF-16, an even number of bytes, in UTF-8. The error is the place, counted in
/// bytes, of a surrogate that has no partner.
std::expected<std::string, std::size_t> utf8FromUTF16(FndDataView text);

}  // namespace vantrell
