#include "Port/Time.h"

#include <time.h>

#include <limits>

namespace {

constexpr const char* kInvalidTimeText = "invalid time\n";
constexpr const char* kDayNames[] = {"Sun", "Mon", "Tue", "Wed", "Thu", "Fri", "Sat"};
constexpr const char* kMonthNames[] = {"Jan", "Feb", "Mar", "Apr", "May", "Jun",
                                       "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};

bool HasNamedFields(const tm& calendar) {
  return calendar.tm_wday >= 0 && calendar.tm_wday < 7 && calendar.tm_mon >= 0 && calendar.tm_mon < 12;
}

}  // namespace

bool UT_CPUTIME::GetCurrTime(std::int64_t* seconds, std::int64_t* microseconds) {
  if (!seconds || !microseconds) return false;
  timespec now{};
  if (clock_gettime(CLOCK_REALTIME, &now) != 0) return false;
  *seconds = static_cast<std::int64_t>(now.tv_sec);
  *microseconds = static_cast<std::int64_t>(now.tv_nsec / 1000);
  return true;
}

void UT_CPUTIME::normalize(std::int64_t* seconds, std::int64_t* microseconds) {
  if (!seconds || !microseconds) return;
  std::int64_t carry = *microseconds / kMicrosecondsPerSecond;
  std::int64_t rest = *microseconds % kMicrosecondsPerSecond;
  if (rest < 0) {
    rest += kMicrosecondsPerSecond;
    --carry;
  }
  std::int64_t sum = 0;
  if (__builtin_add_overflow(*seconds, carry, &sum)) {
    const bool upward = carry > 0;
    *seconds = upward ? std::numeric_limits<std::int64_t>::max() : std::numeric_limits<std::int64_t>::min();
    *microseconds = upward ? kMicrosecondsPerSecond - 1 : 0;
    return;
  }
  *seconds = sum;
  *microseconds = rest;
}

Port::StringBase UT_TIME::CTime(std::int64_t seconds) {
  if constexpr (sizeof(time_t) < sizeof(std::int64_t)) {
    if (seconds < std::numeric_limits<time_t>::min() || seconds > std::numeric_limits<time_t>::max())
      return kInvalidTimeText;
  }
  // Picks up a changed TZ, as the C library's non-reentrant calendar calls do.
  tzset();
  const time_t when = static_cast<time_t>(seconds);
  tm calendar{};
  if (!localtime_r(&when, &calendar) || !HasNamedFields(calendar)) return kInvalidTimeText;
  Port::StringBase text;
  // The year is widened first: a year near the end of int's range would overflow.
  text.Format("%s %s %2d %02d:%02d:%02d %lld\n", kDayNames[calendar.tm_wday], kMonthNames[calendar.tm_mon],
              calendar.tm_mday, calendar.tm_hour, calendar.tm_min, calendar.tm_sec,
              static_cast<long long>(calendar.tm_year) + 1900);
  return text;
}
