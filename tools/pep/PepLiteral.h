// Values of the integer literals of both languages.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace PepLiteral {

// The value of `digits` in `base` (2 to 16), underscores ignored; none when a character is no
// digit of the base, when there is no digit at all or when the value does not fit 63 bits.
std::optional<std::int64_t> DigitsValue(std::string_view digits, int base);

// value * base^exponent, none on overflow.
std::optional<std::int64_t> Scaled(std::int64_t value, std::int64_t base, std::int64_t exponent);

}  // namespace PepLiteral
