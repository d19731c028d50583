#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <unordered_map>

namespace vantrell {

/// How deep containers may stand in each other, in memory and on disk.
inline constexpr std::size_t kDeepestNesting = 512;

/// How many values may be written, each counted wherever it stands.
inline constexpr std::uint64_t kMostValuesWritten = std::uint64_t{1} << 24;

/// Tells whether a tree may be written, without walking a shared container more than once: sixty
/// levels of lists that each hold the next one twice would otherwise take for ever.
///
/// `Shape::container(value)` is the address of what a container shares, null for a scalar;
/// `Shape::forEachChild(value, each)` calls `each` until it answers false.
template <class Value, class Shape>
class TreeMeasure {
 public:
  /// False when `root` nests deeper than `kDeepestNesting` or unfolds to more than
  /// `kMostValuesWritten` values.
  bool fits(const Value& root) {
    const auto extent = measure(root, 0);
    return extent && extent->values <= kMostValuesWritten;
  }

 private:
  struct Extent {
    std::uint64_t values;
    std::size_t height;  // of containers
  };

  std::optional<Extent> measure(const Value& value, std::size_t depth) {
    const void* const container = Shape::container(value);
    if (container == nullptr) return Extent{1, 0};
    if (depth == kDeepestNesting) return std::nullopt;
    if (const auto known = _known.find(container); known != _known.end()) return known->second;
    Extent extent{1, 1};
    bool bounded = true;
    Shape::forEachChild(value, [&](const Value& child) {
      const auto inner = measure(child, depth + 1);
      bounded = inner && inner->height < kDeepestNesting;
      if (!bounded) return false;
      extent.values = std::min(extent.values + inner->values, kMostValuesWritten + 1);
      extent.height = std::max(extent.height, inner->height + 1);
      return true;
    });
    if (!bounded) return std::nullopt;
    _known.emplace(container, extent);
    return extent;
  }

  std::unordered_map<const void*, Extent> _known;
};

}  // namespace vantrell
