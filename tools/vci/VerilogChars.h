// Character classes of Verilog source text, by table so that scanning loops stay cheap.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace Hx_Vci::VerilogChars {

enum : std::uint8_t {
  kSpace = 1,
  kIdentifierStart = 2,
  kIdentifierChar = 4,
  kDigit = 8,
  // Characters the preprocessor must look at: directives and macros, comments, strings and
  // escaped identifiers (which may contain any of the others).
  kPreprocessorSpecial = 16,
};

constexpr std::array<std::uint8_t, 256> MakeTable() {
  std::array<std::uint8_t, 256> table{};
  for (int c : {' ', '\t', '\n', '\r', '\f', '\v'}) table[c] |= kSpace;
  for (int c = 'a'; c <= 'z'; ++c) table[c] |= kIdentifierStart | kIdentifierChar;
  for (int c = 'A'; c <= 'Z'; ++c) table[c] |= kIdentifierStart | kIdentifierChar;
  table['_'] |= kIdentifierStart | kIdentifierChar;
  for (int c = '0'; c <= '9'; ++c) table[c] |= kDigit | kIdentifierChar;
  table['$'] |= kIdentifierChar;
  for (int c : {'`', '/', '"', '\\'}) table[c] |= kPreprocessorSpecial;
  return table;
}

inline constexpr std::array<std::uint8_t, 256> kTable = MakeTable();

inline bool Has(char c, std::uint8_t mask) { return (kTable[static_cast<unsigned char>(c)] & mask) != 0; }
inline bool IsSpace(char c) { return Has(c, kSpace); }
inline bool IsIdentifierStart(char c) { return Has(c, kIdentifierStart); }
inline bool IsIdentifierChar(char c) { return Has(c, kIdentifierChar); }
inline bool IsDigit(char c) { return Has(c, kDigit); }
// Space other than a line break: what may separate a directive from its arguments.
inline bool IsLineSpace(char c) { return c != '\n' && IsSpace(c); }

// End of the identifier that starts at `from`, or `from` when none starts there.
inline std::size_t ScanIdentifier(std::string_view text, std::size_t from) {
  if (from >= text.size() || !IsIdentifierStart(text[from])) {
    return from;
  }
  std::size_t end = from + 1;
  while (end < text.size() && IsIdentifierChar(text[end])) ++end;
  return end;
}

// Length of a backslash-newline line continuation at `at` ("\\\n" or "\\\r\n"), 0 when none.
inline std::size_t ContinuationLength(std::string_view text, std::size_t at) {
  if (at + 1 < text.size() && text[at] == '\\') {
    if (text[at + 1] == '\n') return 2;
    if (text[at + 1] == '\r' && at + 2 < text.size() && text[at + 2] == '\n') return 3;
  }
  return 0;
}

}  // namespace Hx_Vci::VerilogChars
