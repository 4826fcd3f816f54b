// 128-bit class and interface identifiers.
#pragma once

#include <compare>
#include <cstdint>
#include <string>
#include <string_view>

namespace Port {

class StringBase;

// An identifier is two 64-bit words. Brace-enclosed GUID text maps onto them by reading the 32
// hexadecimal digits left to right with the dashes dropped: the first 16 digits give the high
// word, the last 16 the low word. Identifiers built from text and from words therefore agree.
class XUID {
 public:
  constexpr XUID() = default;
  constexpr XUID(std::uint64_t high, std::uint64_t low) : high_(high), low_(low) {}

  // Builds from "{xxxxxxxx-xxxx-xxxx-xxxx-xxxxxxxxxxxx}" (either letter case). Malformed text
  // yields the null identifier; use Parse to tell that case apart.
  explicit XUID(std::string_view text);

  // A fresh identifier, unique within this process and very likely across processes.
  static XUID New();

  // False, leaving `out` untouched, when `text` is not GUID text of the form above.
  static bool Parse(std::string_view text, XUID& out);

  constexpr std::uint64_t High() const { return high_; }
  constexpr std::uint64_t Low() const { return low_; }
  constexpr bool IsNull() const { return high_ == 0 && low_ == 0; }

  // "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}" in upper case.
  std::string ToString() const;

  constexpr bool operator==(const XUID&) const = default;
  constexpr std::strong_ordering operator<=>(const XUID&) const = default;

 private:
  std::uint64_t high_ = 0;
  std::uint64_t low_ = 0;
};

}  // namespace Port
