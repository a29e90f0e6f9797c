#include <gtest/gtest.h>
#include <time.h>

#include <limits>
#include <memory>

#include "interfaces/portability/UT_TIME.h"
#include "tests/unit/support/ScopedVariable.h"

namespace {

/// The local time zone of the process while the object lives.
class TimeZone {
 public:
  explicit TimeZone(const char* name) : variable_(std::make_unique<testsupport::ScopedVariable>("TZ", name)) {
    ::tzset();
  }
  ~TimeZone() {
    variable_.reset();
    ::tzset();
  }
  TimeZone(const TimeZone&) = delete;
  TimeZone& operator=(const TimeZone&) = delete;

 private:
  std::unique_ptr<testsupport::ScopedVariable> variable_;
};

struct Row {
  const char* zone;
  std::int64_t time;
  const char* expected;
};

TEST(UT_TIME, CTimeIsLocalTime) {
  constexpr Row rows[] = {{"UTC0", 0, "1970-01-01 00:00:00"},          {"UTC0", -1, "1969-12-31 23:59:59"},
                          {"UTC0", 1773065100, "2026-03-09 14:05:00"}, {"UTC0", 951782400, "2000-02-29 00:00:00"},
                          {"UTC0", 4102444800, "2100-01-01 00:00:00"}, {"EAST-5:30", 0, "1970-01-01 05:30:00"},
                          {"WEST+8", 0, "1969-12-31 16:00:00"}};
  for (const Row& row : rows) {
    const TimeZone zone(row.zone);
    EXPECT_EQ(UT_TIME::CTime(row.time), StringBase(row.expected)) << row.zone << ' ' << row.time;
  }
}

TEST(UT_TIME, CTimeOfNoCalendarYearIsHarmless) {
  const StringBase text = UT_TIME::CTime(std::numeric_limits<std::int64_t>::max());
  EXPECT_FALSE(text.empty());
  EXPECT_EQ(text.GetIndexOfString("\n", 0), -1);
}

TEST(UT_TIME, TimeIsTheSystemsTime) {
  const std::int64_t before = ::time(nullptr);
  const std::int64_t now = UT_TIME::Time();
  std::int64_t stored = 0;
  const std::int64_t given = _time64(&stored);
  const std::int64_t again = _time64(nullptr);
  const std::int64_t after = ::time(nullptr);
  EXPECT_LE(before, now);
  EXPECT_LE(now, given);
  EXPECT_EQ(given, stored);
  EXPECT_LE(given, again);
  EXPECT_LE(again, after);
}

TEST(UT_TIME, DifferenceHasASign) {
  EXPECT_EQ(_difftime64(12, 10), 2.0);
  EXPECT_EQ(_difftime64(10, 12), -2.0);
  EXPECT_EQ(_difftime64(5, 5), 0.0);
}

TEST(UT_TIME, DifferenceOfTheFarthestTimesDoesNotWrap) {
  constexpr std::int64_t first = std::numeric_limits<std::int64_t>::min();
  constexpr std::int64_t last = std::numeric_limits<std::int64_t>::max();
  EXPECT_DOUBLE_EQ(_difftime64(last, first), 18446744073709551615.0);
  EXPECT_DOUBLE_EQ(_difftime64(first, last), -18446744073709551615.0);
}

}  // namespace
