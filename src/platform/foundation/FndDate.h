#pragma once

#include <compare>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace vantrell {

/// A moment, to the nanosecond, anywhere in the years that a file system or an archive can name.
///
/// Archives store a date as seconds since 2001-01-01 UTC in a double, which is good to about
/// 0.1 microseconds in this century; a date that has been through one compares unequal to the
/// original when the original was finer than that.
class FndDate {
 public:
  /// `seconds` since 1970-01-01 UTC, and `nanoseconds` (0 to 999,999,999) after that second.
  static FndDate fromUnixTime(std::int64_t seconds, std::uint32_t nanoseconds = 0);
  /// `seconds` since 2001-01-01 UTC. None unless finite and within a million years.
  static std::optional<FndDate> fromSecondsSinceReferenceDate(double seconds);
  /// Reads RFC 3339: "2026-11-21T18:53:15.25Z", or with an offset such as "+01:00".
  static std::optional<FndDate> fromRFC3339(std::string_view text);

  std::int64_t unixSeconds() const { return _seconds; }
  std::uint32_t nanoseconds() const { return _nanoseconds; }
  double secondsSinceReferenceDate() const;

  /// RFC 3339 in UTC; a fraction only when there is one, without trailing zeros. A year that has
  /// not four digits gets a sign: "+12026-01-01T00:00:00Z".
  std::string description() const;

  auto operator<=>(const FndDate&) const = default;

 private:
  FndDate(std::int64_t seconds, std::uint32_t nanoseconds)
      : _seconds(seconds), _nanoseconds(nanoseconds) {}

  std::int64_t _seconds;
  std::uint32_t _nanoseconds;
};

}  // namespace vantrell
