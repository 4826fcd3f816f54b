// Walks the bytes of one source text for a lexer: look ahead, step, and collect token text with
// the length cap of PepToken. Reads past the end as '\0' so lexers never index out of range.
#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <string_view>

#include "pep/PepToken.h"

class PepTextCursor {
 public:
  explicit PepTextCursor(std::string_view text) : text_(text) {}

  bool AtEnd() const { return position_ >= text_.size(); }
  char Peek(std::size_t ahead = 0) const;
  char Take();
  void Skip(std::size_t count);
  std::size_t Position() const { return position_; }
  void SkipToLineEnd();
  // Skips to just past `closing`, or to the end of the text when it never comes.
  void SkipPast(std::string_view closing);
  std::size_t CountBlanksFrom(std::size_t ahead) const;
  // A delimiter of one character, or of two when they spell one of `twoCharacterSymbols`; a byte
  // that is no printable ASCII character becomes a kOther token.
  PepToken TakeSymbol(std::span<const std::string_view> twoCharacterSymbols);

  static void Append(std::string& text, char c) {
    if (text.size() < PepToken::kMaxTextLength) text.push_back(c);
  }

 private:
  std::string_view text_;
  std::size_t position_ = 0;
};

namespace PepChars {
inline bool IsLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }
inline bool IsDigit(char c) { return c >= '0' && c <= '9'; }
inline bool IsBlank(char c) {
  return c == ' ' || c == '\t' || c == '\r' || c == '\n' || c == '\f' || c == '\v';
}
inline char Lower(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }
// The value of c as a digit of any base up to 16, or -1.
int DigitValue(char c);
}  // namespace PepChars
