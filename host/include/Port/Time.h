// Wall-clock time as seconds and microseconds since the epoch, and its calendar text.
#pragma once

#include <cstdint>

#include "Port/StringBase.h"

class UT_CPUTIME {
 public:
  static constexpr std::int64_t kMicrosecondsPerSecond = 1000000;

  // The current wall-clock time. False, leaving both untouched, when either pointer is null or
  // the clock cannot be read.
  static bool GetCurrTime(std::int64_t* seconds, std::int64_t* microseconds);

  // Carries whole seconds out of `microseconds` (either sign) into `seconds`, leaving
  // 0 <= microseconds < 1,000,000. Seconds that would overflow stop at the limit of their range,
  // with the microseconds at the matching end. Null pointers are ignored.
  static void normalize(std::int64_t* seconds, std::int64_t* microseconds);
};

class UT_TIME {
 public:
  // The local calendar time of `seconds` as "Sun Dec  6 09:52:59 2026\n" (C-locale names, the
  // trailing line feed included), or "invalid time\n" when the time cannot be represented.
  static Port::StringBase CTime(std::int64_t seconds);
};
