#include "pep/PepVhdlLexer.h"

#include "pep/PepLiteral.h"

namespace {

bool IsIdentifierChar(char c) { return PepChars::IsLetter(c) || PepChars::IsDigit(c) || c == '_'; }

constexpr std::string_view kTwoCharacterSymbols[] = {"**", ":=", "=>", "<=", ">=", "/=", "<>"};

}  // namespace

PepToken PepVhdlLexer::Next() {
  SkipBlanksAndComments();
  PepToken token;
  char c = cursor_.Peek();
  if (cursor_.AtEnd()) {
    token.kind = PepToken::Kind::kEnd;
  } else if (PepChars::IsLetter(c)) {
    token = ReadIdentifier();
  } else if (c == '\\') {
    token = ReadExtendedIdentifier();
  } else if (PepChars::IsDigit(c)) {
    token = ReadNumber();
  } else if (c == '"') {
    token = ReadQuoted('"');
  } else if (c == '\'' && StartsCharacterLiteral()) {
    token = ReadQuoted('\'');
  } else {
    token = ReadSymbol();
  }
  previousEndsName_ = token.kind == PepToken::Kind::kName || token.IsSymbol(")");
  return token;
}

void PepVhdlLexer::SkipBlanksAndComments() {
  for (;;) {
    char c = cursor_.Peek();
    if (PepChars::IsBlank(c)) {
      cursor_.Skip(1);
    } else if (c == '-' && cursor_.Peek(1) == '-') {
      cursor_.SkipToLineEnd();
    } else if (c == '/' && cursor_.Peek(1) == '*') {
      cursor_.Skip(2);
      cursor_.SkipPast("*/");
    } else {
      return;
    }
  }
}

PepToken PepVhdlLexer::ReadIdentifier() {
  PepToken token;
  token.kind = PepToken::Kind::kName;
  while (IsIdentifierChar(cursor_.Peek())) {
    char c = cursor_.Take();
    PepTextCursor::Append(token.text, c);
    PepTextCursor::Append(token.key, PepChars::Lower(c));
  }
  return token;
}

PepToken PepVhdlLexer::ReadExtendedIdentifier() {
  PepToken token;
  token.kind = PepToken::Kind::kName;
  token.escaped = true;
  PepTextCursor::Append(token.text, cursor_.Take());
  while (!cursor_.AtEnd() && cursor_.Peek() != '\n') {
    char c = cursor_.Take();
    PepTextCursor::Append(token.text, c);
    if (c == '\\') {
      if (cursor_.Peek() != '\\') break;
      cursor_.Skip(1);  // a doubled backslash stands for one
    }
  }
  token.key = token.text;
  return token;
}

// Decimal (1_000, 1E3, 2.5) and based (16#FF#, 2#1010#E2) literals; reals get no value.
PepToken PepVhdlLexer::ReadNumber() {
  PepToken token;
  token.kind = PepToken::Kind::kNumber;
  std::string digits;
  while (PepChars::IsDigit(cursor_.Peek()) || cursor_.Peek() == '_') {
    char c = cursor_.Take();
    PepTextCursor::Append(token.text, c);
    PepTextCursor::Append(digits, c);
  }
  bool isReal = false;
  std::int64_t base = 10;
  if (cursor_.Peek() == '#') {
    base = PepLiteral::DigitsValue(digits, 10).value_or(0);
    PepTextCursor::Append(token.text, cursor_.Take());
    std::string based;
    while (PepChars::DigitValue(cursor_.Peek()) >= 0 || cursor_.Peek() == '_' || cursor_.Peek() == '.') {
      char c = cursor_.Take();
      isReal = isReal || c == '.';
      PepTextCursor::Append(token.text, c);
      PepTextCursor::Append(based, c);
    }
    if (cursor_.Peek() == '#') PepTextCursor::Append(token.text, cursor_.Take());
    if (base >= 2 && base <= 16 && !isReal)
      token.value = PepLiteral::DigitsValue(based, static_cast<int>(base));
  } else {
    if (cursor_.Peek() == '.' && PepChars::IsDigit(cursor_.Peek(1))) {
      isReal = true;
      PepTextCursor::Append(token.text, cursor_.Take());
      while (PepChars::IsDigit(cursor_.Peek()) || cursor_.Peek() == '_') {
        PepTextCursor::Append(token.text, cursor_.Take());
      }
    }
    if (!isReal) token.value = PepLiteral::DigitsValue(digits, 10);
  }
  ReadExponent(token, base, isReal);
  token.key = token.text;
  return token;
}

// The exponent of a based literal is a power of its base: 16#F#E1 is 240.
void PepVhdlLexer::ReadExponent(PepToken& token, std::int64_t base, bool isReal) {
  bool signedExponent = cursor_.Peek(1) == '+' || cursor_.Peek(1) == '-';
  std::size_t firstDigit = signedExponent ? 2 : 1;
  if (PepChars::Lower(cursor_.Peek()) != 'e' || !PepChars::IsDigit(cursor_.Peek(firstDigit))) return;
  bool negative = cursor_.Peek(1) == '-';
  std::string digits;
  for (std::size_t i = 0; i < firstDigit; ++i) PepTextCursor::Append(token.text, cursor_.Take());
  while (PepChars::IsDigit(cursor_.Peek()) || cursor_.Peek() == '_') {
    char c = cursor_.Take();
    PepTextCursor::Append(token.text, c);
    PepTextCursor::Append(digits, c);
  }
  std::optional<std::int64_t> exponent = PepLiteral::DigitsValue(digits, 10);
  if (isReal || negative || !exponent || !token.value) {
    token.value.reset();  // an integer literal cannot have a negative exponent
  } else {
    token.value = PepLiteral::Scaled(*token.value, base, *exponent);
  }
}

PepToken PepVhdlLexer::ReadQuoted(char quote) {
  PepToken token;
  token.kind = PepToken::Kind::kString;
  PepTextCursor::Append(token.text, cursor_.Take());
  if (quote == '\'') {
    PepTextCursor::Append(token.text, cursor_.Take());
    PepTextCursor::Append(token.text, cursor_.Take());
  } else {
    while (!cursor_.AtEnd() && cursor_.Peek() != '\n') {
      char c = cursor_.Take();
      PepTextCursor::Append(token.text, c);
      if (c == quote) {
        if (cursor_.Peek() != quote) break;
        PepTextCursor::Append(token.text, cursor_.Take());
      }
    }
  }
  token.key = token.text;
  return token;
}

bool PepVhdlLexer::StartsCharacterLiteral() const { return !previousEndsName_ && cursor_.Peek(2) == '\''; }

PepToken PepVhdlLexer::ReadSymbol() { return cursor_.TakeSymbol(kTwoCharacterSymbols); }
