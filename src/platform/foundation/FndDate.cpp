#include "platform/foundation/FndDate.h"

#include <array>
#include <chrono>
#include <cmath>
#include <cstdio>

namespace vantrell {
namespace {

constexpr std::int64_t kReferenceDate = 978307200;  // 2001-01-01T00:00:00Z in Unix time
constexpr double kMillionYears = 3.2e13;            // in seconds
constexpr std::uint32_t kNanosecondsPerSecond = 1'000'000'000;
constexpr std::int64_t kSecondsPerDay = 86400;

// Reads `width` digits at the front of `text` and takes them off it.
std::optional<int> digits(std::string_view& text, std::size_t width) {
  if (text.size() < width) return std::nullopt;
  int value = 0;
  for (const char c : text.substr(0, width)) {
    if (c < '0' || c > '9') return std::nullopt;
    value = value * 10 + (c - '0');
  }
  text.remove_prefix(width);
  return value;
}

bool take(std::string_view& text, std::string_view oneOf) {
  if (text.empty() || oneOf.find(text.front()) == std::string_view::npos) return false;
  text.remove_prefix(1);
  return true;
}

std::optional<std::int64_t> calendarDay(std::string_view& text) {
  const auto year = digits(text, 4);
  if (!year || !take(text, "-")) return std::nullopt;
  const auto month = digits(text, 2);
  if (!month || !take(text, "-")) return std::nullopt;
  const auto day = digits(text, 2);
  if (!day) return std::nullopt;
  const std::chrono::year_month_day date{std::chrono::year(*year),
                                         std::chrono::month(static_cast<unsigned>(*month)),
                                         std::chrono::day(static_cast<unsigned>(*day))};
  if (!date.ok()) return std::nullopt;
  return std::chrono::sys_days(date).time_since_epoch().count();
}

std::optional<std::int64_t> secondOfDay(std::string_view& text) {
  const auto hour = digits(text, 2);
  if (!hour || *hour > 23 || !take(text, ":")) return std::nullopt;
  const auto minute = digits(text, 2);
  if (!minute || *minute > 59 || !take(text, ":")) return std::nullopt;
  const auto second = digits(text, 2);
  if (!second || *second > 60) return std::nullopt;  // 60: a leap second counts as the next one
  return (*hour * 60 + *minute) * 60 + *second;
}

std::optional<std::uint32_t> fraction(std::string_view& text) {
  if (!take(text, ".")) return 0;
  std::uint32_t value = 0;
  std::uint32_t unit = kNanosecondsPerSecond;
  std::size_t count = 0;
  while (!text.empty() && text.front() >= '0' && text.front() <= '9') {
    unit /= 10;
    value += unit * static_cast<std::uint32_t>(text.front() - '0');
    text.remove_prefix(1);
    ++count;
  }
  if (count == 0) return std::nullopt;
  return value;
}

// Seconds to take off a local time to have UTC.
std::optional<std::int64_t> zoneOffset(std::string_view& text) {
  if (take(text, "Zz")) return 0;
  const bool west = !text.empty() && text.front() == '-';
  if (!take(text, "+-")) return std::nullopt;
  const auto hours = digits(text, 2);
  if (!hours || *hours > 23 || !take(text, ":")) return std::nullopt;
  const auto minutes = digits(text, 2);
  if (!minutes || *minutes > 59) return std::nullopt;
  const std::int64_t seconds = std::int64_t{*hours * 60 + *minutes} * 60;
  return west ? -seconds : seconds;
}

std::int64_t floorDivide(std::int64_t value, std::int64_t by) {
  return value / by - (value % by < 0 ? 1 : 0);
}

std::int64_t floorRemainder(std::int64_t value, std::int64_t by) {
  return value % by + (value % by < 0 ? by : 0);
}

struct CalendarDay {
  std::int64_t year;
  int month;
  int day;
};

// The Gregorian calendar in 64 bits: the standard library's ends with the year 32767, and a file
// may claim to be from far beyond. Years are counted from March here, so that the leap day comes
// last, in cycles of 400 years.
CalendarDay calendarDayOf(std::int64_t daysSince1970) {
  constexpr std::int64_t kDaysInCycle = 146097;
  constexpr std::int64_t kDaysFromMarchOfYear0 = 719468;
  const std::int64_t days = daysSince1970 + kDaysFromMarchOfYear0;
  const std::int64_t dayOfCycle = floorRemainder(days, kDaysInCycle);
  const std::int64_t yearOfCycle =
      (dayOfCycle - dayOfCycle / 1460 + dayOfCycle / 36524 - dayOfCycle / (kDaysInCycle - 1)) / 365;
  const std::int64_t dayOfYear =
      dayOfCycle - (365 * yearOfCycle + yearOfCycle / 4 - yearOfCycle / 100);
  const auto monthFromMarch = static_cast<int>((5 * dayOfYear + 2) / 153);
  const auto day = static_cast<int>(dayOfYear) - (153 * monthFromMarch + 2) / 5 + 1;
  const int month = monthFromMarch < 10 ? monthFromMarch + 3 : monthFromMarch - 9;
  const std::int64_t year = floorDivide(days, kDaysInCycle) * 400 + yearOfCycle;
  return {month <= 2 ? year + 1 : year, month, day};
}

}  // namespace

FndDate FndDate::fromUnixTime(std::int64_t seconds, std::uint32_t nanoseconds) {
  return FndDate(seconds, nanoseconds);
}

std::optional<FndDate> FndDate::fromSecondsSinceReferenceDate(double seconds) {
  if (!std::isfinite(seconds) || std::fabs(seconds) > kMillionYears) return std::nullopt;
  const double whole = std::floor(seconds);
  auto unixSeconds = static_cast<std::int64_t>(whole) + kReferenceDate;
  auto nanoseconds = static_cast<std::uint32_t>(
      std::llround((seconds - whole) * static_cast<double>(kNanosecondsPerSecond)));
  if (nanoseconds == kNanosecondsPerSecond) {  // rounded up to the next second
    ++unixSeconds;
    nanoseconds = 0;
  }
  return FndDate(unixSeconds, nanoseconds);
}

std::optional<FndDate> FndDate::fromRFC3339(std::string_view text) {
  const auto day = calendarDay(text);
  if (!day || !take(text, "Tt ")) return std::nullopt;
  const auto second = secondOfDay(text);
  if (!second) return std::nullopt;
  const auto nanoseconds = fraction(text);
  if (!nanoseconds) return std::nullopt;
  const auto offset = zoneOffset(text);
  if (!offset || !text.empty()) return std::nullopt;
  return FndDate(*day * kSecondsPerDay + *second - *offset, *nanoseconds);
}

double FndDate::secondsSinceReferenceDate() const {
  // Subtracted as doubles: the integers could overflow, and both are exact in any real century.
  return static_cast<double>(_seconds) - static_cast<double>(kReferenceDate) +
         static_cast<double>(_nanoseconds) / static_cast<double>(kNanosecondsPerSecond);
}

std::string FndDate::description() const {
  const CalendarDay day = calendarDayOf(floorDivide(_seconds, kSecondsPerDay));
  const auto time = static_cast<int>(floorRemainder(_seconds, kSecondsPerDay));
  std::array<char, 64> text{};
  const bool isFourDigits = day.year >= 0 && day.year <= 9999;
  int length = std::snprintf(
      text.data(), text.size(),
      isFourDigits ? "%04lld-%02d-%02dT%02d:%02d:%02d" : "%+05lld-%02d-%02dT%02d:%02d:%02d",
      static_cast<long long>(day.year), day.month, day.day, time / 3600, time / 60 % 60, time % 60);
  std::string result(text.data(), static_cast<std::size_t>(length));
  if (_nanoseconds != 0) {
    length = std::snprintf(text.data(), text.size(), ".%09u", _nanoseconds);
    std::string_view digitsShown(text.data(), static_cast<std::size_t>(length));
    result += digitsShown.substr(0, digitsShown.find_last_not_of('0') + 1);
  }
  return result + "Z";
}

}  // namespace vantrell
