#pragma once

#include <cstdint>
#include <span>
#include <vector>

namespace vantrell {

/// Bytes that somebody owns.
using FndData = std::vector<std::uint8_t>;

/// Bytes that somebody else owns for as long as the call lasts.
using FndDataView = std::span<const std::uint8_t>;

}  // namespace vantrell
