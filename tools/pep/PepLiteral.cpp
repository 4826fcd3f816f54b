#include "pep/PepLiteral.h"

#include "pep/PepTextCursor.h"

std::optional<std::int64_t> PepLiteral::DigitsValue(std::string_view digits, int base) {
  std::int64_t value = 0;
  bool sawDigit = false;
  for (char c : digits) {
    if (c == '_') continue;
    int digit = PepChars::DigitValue(c);
    if (digit < 0 || digit >= base) return std::nullopt;
    if (__builtin_mul_overflow(value, base, &value) || __builtin_add_overflow(value, digit, &value)) {
      return std::nullopt;
    }
    sawDigit = true;
  }
  if (!sawDigit) return std::nullopt;
  return value;
}

std::optional<std::int64_t> PepLiteral::Scaled(std::int64_t value, std::int64_t base, std::int64_t exponent) {
  // base >= 2 overflows within 63 steps, so the loop is short whatever the exponent.
  for (std::int64_t i = 0; i < exponent && value != 0; ++i) {
    if (__builtin_mul_overflow(value, base, &value)) return std::nullopt;
  }
  return value;
}
