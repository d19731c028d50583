#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "platform/foundation/FndData.h"

namespace vantrell {

/// A binary property list put together object by object, well-formed or not.
///
/// Threads: use each from one thread at a time.
class RawPropertyList {
 public:
  using References = std::vector<std::uint64_t>;

  explicit RawPropertyList(std::size_t referenceSize = 1, std::size_t offsetSize = 4)
      : _referenceSize(referenceSize), _offsetSize(offsetSize) {}

  /// These give the number of the object.
  std::uint64_t add(FndData object);
  std::uint64_t addString(std::string_view ascii);
  std::uint64_t addArray(const References& elements);
  std::uint64_t addDictionary(const References& keys, const References& values);
  /// One more number for an object that has one already.
  std::uint64_t addAgain(std::uint64_t object);

  void setTop(std::uint64_t object) { _top = object; }
  /// Written into the trailer in place of the truth.
  void claimCount(std::uint64_t count) { _claimedCount = count; }
  void claimTableOffset(std::uint64_t offset) { _claimedTableOffset = offset; }
  void claimSizes(std::uint8_t offsetSize, std::uint8_t referenceSize);

  FndData bytes() const;

 private:
  void appendCounted(FndData& object, std::uint8_t type, std::uint64_t count) const;

  struct Sizes {
    std::uint8_t offset;
    std::uint8_t reference;
  };

  std::size_t _referenceSize;
  std::size_t _offsetSize;
  FndData _objects;
  std::vector<std::uint64_t> _offsets;
  std::uint64_t _top = 0;
  std::optional<std::uint64_t> _claimedCount;
  std::optional<std::uint64_t> _claimedTableOffset;
  std::optional<Sizes> _claimedSizes;
};

/// `value` in `size` bytes, big-endian; in more than eight the first ones are zero.
FndData bigEndianBytes(std::uint64_t value, std::size_t size);

/// The bytes that two hexadecimal digits each spell; blanks are skipped.
FndData bytesFromHex(std::string_view digits);

}  // namespace vantrell
