#include "platform/foundation/FndDate.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace vantrell {
namespace {

constexpr std::int64_t kFirstYear = -62167219200;   // 0000-01-01T00:00:00Z
constexpr std::int64_t kLastSecond = 253402300799;  // 9999-12-31T23:59:59Z

FndDate read(const char* text) {
  const auto date = FndDate::fromRFC3339(text);
  EXPECT_TRUE(date) << text;
  return date.value_or(FndDate::fromUnixTime(0));
}

TEST(FndDate, RFC3339IsReadAndWritten) {
  const struct {
    const char* text;
    std::int64_t seconds;
    std::uint32_t nanoseconds;
  } kRows[] = {
      {"1970-01-01T00:00:00Z", 0, 0},
      {"2001-01-01T00:00:00Z", 978307200, 0},
      {"2026-11-21T18:53:15.25Z", 1795287195, 250000000},
      {"2000-02-29T23:59:59.999999999Z", 951868799, 999999999},
      {"1969-12-31T23:59:59.5Z", -1, 500000000},
      {"1600-02-29T00:00:00Z", -11670998400, 0},
      {"1900-03-01T00:00:00Z", -2203891200, 0},
      {"0000-01-01T00:00:00Z", kFirstYear, 0},
      {"9999-12-31T23:59:59Z", kLastSecond, 0},
  };
  for (const auto& row : kRows) {
    EXPECT_EQ(read(row.text), FndDate::fromUnixTime(row.seconds, row.nanoseconds)) << row.text;
    EXPECT_EQ(FndDate::fromUnixTime(row.seconds, row.nanoseconds).description(), row.text);
  }
}

TEST(FndDate, EveryDayOfFourCenturiesIsWrittenAsItIsRead) {
  constexpr std::int64_t kDay = 86400;
  for (std::int64_t day = -11000; day < 135000; ++day) {
    const FndDate date = FndDate::fromUnixTime(day * kDay + 12345);
    ASSERT_EQ(FndDate::fromRFC3339(date.description()), date) << day;
  }
}

TEST(FndDate, OffsetsLowerCaseAndABlankAreRead) {
  const FndDate noon = read("2026-06-15T12:00:00Z");
  EXPECT_EQ(read("2026-06-15T14:00:00+02:00"), noon);
  EXPECT_EQ(read("2026-06-15T06:30:00-05:30"), noon);
  EXPECT_EQ(read("2026-06-15t12:00:00z"), noon);
  EXPECT_EQ(read("2026-06-15 12:00:00-00:00"), noon);
  EXPECT_EQ(read("2027-01-01T00:30:00+01:00"), read("2026-12-31T23:30:00Z"));
}

TEST(FndDate, ALeapSecondIsTheNextSecond) {
  EXPECT_EQ(read("2016-12-31T23:59:60Z"), read("2017-01-01T00:00:00Z"));
}

TEST(FndDate, DigitsBeyondTheNanosecondAreDropped) {
  EXPECT_EQ(read("2026-01-01T00:00:00.1234567899Z").nanoseconds(), 123456789U);
}

TEST(FndDate, WhatIsNoRFC3339IsNoDate) {
  for (const char* text : {"",
                           "2026",
                           "2026-01-01",
                           "2026-01-01T00:00:00",
                           "2026-01-01T00:00Z",
                           "2026-13-01T00:00:00Z",
                           "2026-00-01T00:00:00Z",
                           "2026-02-29T00:00:00Z",
                           "2026-01-32T00:00:00Z",
                           "2026-01-01T24:00:00Z",
                           "2026-01-01T00:60:00Z",
                           "2026-01-01T00:00:61Z",
                           "2026-01-01T00:00:00.Z",
                           "2026-01-01T00:00:00+24:00",
                           "2026-01-01T00:00:00+01:60",
                           "2026-01-01T00:00:00+0100",
                           "2026-01-01T00:00:00Zx",
                           "2026-01-01T00:00:00 Z",
                           "+026-01-01T00:00:00Z",
                           "-2026-01-01T00:00:00Z",
                           "02026-01-01T00:00:00Z",
                           "2026-1-1T00:00:00Z",
                           "yesterday",
                           "\xff"}) {
    EXPECT_FALSE(FndDate::fromRFC3339(text)) << text;
  }
}

TEST(FndDate, TheReferenceDateIs2001) {
  EXPECT_EQ(FndDate::fromSecondsSinceReferenceDate(0), read("2001-01-01T00:00:00Z"));
  EXPECT_EQ(read("2001-01-01T00:00:01.5Z").secondsSinceReferenceDate(), 1.5);
  EXPECT_EQ(read("2000-12-31T23:59:59.75Z").secondsSinceReferenceDate(), -0.25);
  EXPECT_EQ(FndDate::fromSecondsSinceReferenceDate(-0.25), read("2000-12-31T23:59:59.75Z"));
  EXPECT_EQ(FndDate::fromSecondsSinceReferenceDate(-978307200.5), read("1969-12-31T23:59:59.5Z"));
}

TEST(FndDate, AFractionThatRoundsUpGoesIntoTheNextSecond) {
  const auto date = FndDate::fromSecondsSinceReferenceDate(std::nextafter(1.0, 0.0));
  EXPECT_EQ(date, FndDate::fromSecondsSinceReferenceDate(1));
}

TEST(FndDate, SecondsThatAreNoMomentGiveNoDate) {
  using Limits = std::numeric_limits<double>;
  for (const double seconds : {Limits::infinity(), -Limits::infinity(), Limits::quiet_NaN(),
                               Limits::max(), Limits::lowest(), 3.3e13, -3.3e13}) {
    EXPECT_FALSE(FndDate::fromSecondsSinceReferenceDate(seconds)) << seconds;
  }
  EXPECT_TRUE(FndDate::fromSecondsSinceReferenceDate(3.1e13));
  EXPECT_TRUE(FndDate::fromSecondsSinceReferenceDate(-3.1e13));
}

TEST(FndDate, YearsWithoutFourDigitsAreWrittenWithASign) {
  EXPECT_EQ(FndDate::fromUnixTime(kLastSecond + 1).description(), "+10000-01-01T00:00:00Z");
  EXPECT_EQ(FndDate::fromUnixTime(kFirstYear - 1).description(), "-0001-12-31T23:59:59Z");
  EXPECT_EQ(FndDate::fromUnixTime(std::numeric_limits<std::int64_t>::max()).description(),
            "+292277026596-12-04T15:30:07Z");
  EXPECT_EQ(FndDate::fromUnixTime(std::numeric_limits<std::int64_t>::min()).description(),
            "-292277022657-01-27T08:29:52Z");
}

TEST(FndDate, DatesAreOrderedToTheNanosecond) {
  EXPECT_LT(FndDate::fromUnixTime(-1, 999999999), FndDate::fromUnixTime(0));
  EXPECT_LT(FndDate::fromUnixTime(5, 1), FndDate::fromUnixTime(5, 2));
  EXPECT_EQ(FndDate::fromUnixTime(5, 1), FndDate::fromUnixTime(5, 1));
}

}  // namespace
}  // namespace vantrell
