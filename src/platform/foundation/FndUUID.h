#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace vantrell {

/// 128 bits that name something for good (RFC 9562).
class FndUUID {
 public:
  using Bytes = std::array<std::uint8_t, 16>;

  explicit FndUUID(const Bytes& bytes) : _bytes(bytes) {}
  /// A new random one (version 4), from the system's source of randomness.
  static FndUUID random();
  /// Reads the canonical 36 characters, in either case; none for anything else.
  static std::optional<FndUUID> fromString(std::string_view text);

  const Bytes& bytes() const { return _bytes; }
  bool isZero() const { return _bytes == Bytes{}; }
  /// The canonical 36 characters in upper case, groups of 8-4-4-4-12.
  std::string description() const;

  auto operator<=>(const FndUUID&) const = default;

 private:
  Bytes _bytes;
};

}  // namespace vantrell
