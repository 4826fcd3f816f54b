#include "pep/PepTextCursor.h"

#include <algorithm>

char PepTextCursor::Peek(std::size_t ahead) const {
  return ahead < text_.size() - std::min(position_, text_.size()) ? text_[position_ + ahead] : '\0';
}

char PepTextCursor::Take() {
  if (AtEnd()) return '\0';
  return text_[position_++];
}

void PepTextCursor::Skip(std::size_t count) { position_ = std::min(text_.size(), position_ + count); }

void PepTextCursor::SkipToLineEnd() {
  std::size_t end = text_.find('\n', position_);
  position_ = end == std::string_view::npos ? text_.size() : end;
}

void PepTextCursor::SkipPast(std::string_view closing) {
  std::size_t end = text_.find(closing, position_);
  position_ = end == std::string_view::npos ? text_.size() : end + closing.size();
}

std::size_t PepTextCursor::CountBlanksFrom(std::size_t ahead) const {
  std::size_t count = 0;
  while (PepChars::IsBlank(Peek(ahead + count))) ++count;
  return count;
}

PepToken PepTextCursor::TakeSymbol(std::span<const std::string_view> twoCharacterSymbols) {
  PepToken token;
  char c = Peek();
  bool printable = static_cast<unsigned char>(c) < 0x80 && c > ' ' && c != 0x7f;
  token.kind = printable ? PepToken::Kind::kSymbol : PepToken::Kind::kOther;
  std::size_t length = 1;
  for (std::string_view symbol : twoCharacterSymbols) {
    if (printable && symbol[0] == c && symbol[1] == Peek(1)) length = 2;
  }
  for (std::size_t i = 0; i < length; ++i) token.text.push_back(Take());
  token.key = token.text;
  return token;
}

int PepChars::DigitValue(char c) {
  if (IsDigit(c)) return c - '0';
  char lower = Lower(c);
  if (lower >= 'a' && lower <= 'f') return lower - 'a' + 10;
  return -1;
}
