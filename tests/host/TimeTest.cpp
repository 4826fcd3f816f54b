#include <gtest/gtest.h>
#include <time.h>

#include <cstdint>
#include <limits>
#include <optional>
#include <string>

#include "Port/Env.h"
#include "Port/Time.h"

namespace {

struct TimePair {
  std::int64_t seconds;
  std::int64_t microseconds;
  bool operator==(const TimePair&) const = default;
};

TimePair Normalized(std::int64_t seconds, std::int64_t microseconds) {
  UT_CPUTIME::normalize(&seconds, &microseconds);
  return {seconds, microseconds};
}

void PrintTo(const TimePair& pair, std::ostream* out) {
  *out << pair.seconds << "s " << pair.microseconds << "us";
}

// Runs a test in a fixed time zone and restores the caller's afterwards.
class InUtc : public testing::Test {
 protected:
  void SetUp() override {
    if (const char* zone = Port_Env::GetEnv("TZ")) savedZone_ = zone;
    Port_Env::SetEnv("TZ", "UTC0");
    tzset();
  }
  void TearDown() override {
    if (savedZone_)
      Port_Env::SetEnv("TZ", savedZone_->c_str());
    else
      Port_Env::UnsetEnv("TZ");
    tzset();
  }

 private:
  std::optional<std::string> savedZone_;
};

constexpr std::int64_t kMax = std::numeric_limits<std::int64_t>::max();
constexpr std::int64_t kMin = std::numeric_limits<std::int64_t>::min();

}  // namespace

TEST(UtCpuTime, NormalizeCarriesMicrosecondsBothWaysAndStopsAtTheEndsOfTheRange) {
  EXPECT_EQ(Normalized(5, 2500000), (TimePair{7, 500000}));
  EXPECT_EQ(Normalized(5, 999999), (TimePair{5, 999999}));
  EXPECT_EQ(Normalized(5, 1000000), (TimePair{6, 0}));
  EXPECT_EQ(Normalized(5, -1), (TimePair{4, 999999}));
  EXPECT_EQ(Normalized(5, -2000000), (TimePair{3, 0}));
  EXPECT_EQ(Normalized(-1, -1500000), (TimePair{-3, 500000}));
  EXPECT_EQ(Normalized(0, kMin), (TimePair{kMin / 1000000 - 1, 1000000 + kMin % 1000000}));
  EXPECT_EQ(Normalized(kMax, 1000000), (TimePair{kMax, 999999}));
  EXPECT_EQ(Normalized(kMax, 999999), (TimePair{kMax, 999999}));
  EXPECT_EQ(Normalized(kMin, -1), (TimePair{kMin, 0}));
  std::int64_t seconds = 1;
  UT_CPUTIME::normalize(&seconds, nullptr);
  UT_CPUTIME::normalize(nullptr, &seconds);
  EXPECT_EQ(seconds, 1);
}

TEST(UtCpuTime, CurrentTimeIsNormalizedWallClock) {
  std::int64_t seconds = 0, microseconds = -1;
  ASSERT_TRUE(UT_CPUTIME::GetCurrTime(&seconds, &microseconds));
  EXPECT_GT(seconds, 1577836800);  // 2020-01-01
  EXPECT_GE(microseconds, 0);
  EXPECT_LT(microseconds, 1000000);
  EXPECT_FALSE(UT_CPUTIME::GetCurrTime(nullptr, &microseconds));
  EXPECT_FALSE(UT_CPUTIME::GetCurrTime(&seconds, nullptr));
}

TEST_F(InUtc, CalendarTextHasTheFixedLayoutFollowsTheTimeZoneOrSaysInvalid) {
  EXPECT_EQ(UT_TIME::CTime(0), "Thu Jan  1 00:00:00 1970\n");
  EXPECT_EQ(UT_TIME::CTime(1796550779), "Sun Dec  6 09:52:59 2026\n");
  EXPECT_EQ(UT_TIME::CTime(-1), "Wed Dec 31 23:59:59 1969\n");
  Port_Env::SetEnv("TZ", "UTC-2");
  EXPECT_EQ(UT_TIME::CTime(0), "Thu Jan  1 02:00:00 1970\n");
  EXPECT_EQ(UT_TIME::CTime(kMax), "invalid time\n");
  EXPECT_EQ(UT_TIME::CTime(kMin), "invalid time\n");
}
