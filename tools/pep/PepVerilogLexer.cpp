#include "pep/PepVerilogLexer.h"

#include "pep/PepLiteral.h"

namespace {

bool IsIdentifierStart(char c) { return PepChars::IsLetter(c) || c == '_'; }
bool IsIdentifierChar(char c) { return IsIdentifierStart(c) || PepChars::IsDigit(c) || c == '$'; }

constexpr std::string_view kTwoCharacterSymbols[] = {
    "**", "::", "<=", ">=", "==", "!=", "<<", ">>", "&&", "||"};

bool IsBaseLetter(char c) {
  char lower = PepChars::Lower(c);
  return lower == 'b' || lower == 'o' || lower == 'd' || lower == 'h';
}

int BaseOf(char letter) {
  switch (PepChars::Lower(letter)) {
    case 'b':
      return 2;
    case 'o':
      return 8;
    case 'h':
      return 16;
    default:
      return 10;
  }
}

bool IsBasedDigit(char c) {
  return PepChars::DigitValue(c) >= 0 || c == '_' || c == 'x' || c == 'X' || c == 'z' || c == 'Z' || c == '?';
}

}  // namespace

PepToken PepVerilogLexer::Next() {
  SkipBlanksCommentsAndAttributes();
  char c = cursor_.Peek();
  if (cursor_.AtEnd()) return PepToken{};
  if (IsIdentifierStart(c) || c == '$') return ReadIdentifier(false);
  if (c == '\\') return ReadIdentifier(true);
  if (c == '`') return ReadDirectiveOrMacro();
  if (PepChars::IsDigit(c) || (c == '\'' && BasedPartFollows(0))) return ReadNumber();
  if (c == '"') return ReadString();
  return ReadSymbol();
}

void PepVerilogLexer::SkipBlanksCommentsAndAttributes() {
  for (;;) {
    char c = cursor_.Peek();
    if (PepChars::IsBlank(c)) {
      cursor_.Skip(1);
    } else if (c == '/' && cursor_.Peek(1) == '/') {
      cursor_.SkipToLineEnd();
    } else if (c == '/' && cursor_.Peek(1) == '*') {
      cursor_.Skip(2);
      cursor_.SkipPast("*/");
    } else if (StartsAttribute()) {
      cursor_.Skip(2);
      cursor_.SkipPast("*)");
    } else {
      return;
    }
  }
}

// "(*" opens an attribute unless it is the "(*)" of an event control.
bool PepVerilogLexer::StartsAttribute() const {
  if (cursor_.Peek() != '(' || cursor_.Peek(1) != '*') return false;
  return cursor_.Peek(2 + cursor_.CountBlanksFrom(2)) != ')';
}

PepToken PepVerilogLexer::ReadIdentifier(bool escaped) {
  PepToken token;
  token.kind = PepToken::Kind::kName;
  token.escaped = escaped;
  if (escaped) {
    cursor_.Skip(1);
    while (!cursor_.AtEnd() && !PepChars::IsBlank(cursor_.Peek())) {
      PepTextCursor::Append(token.text, cursor_.Take());
    }
  } else {
    PepTextCursor::Append(token.text, cursor_.Take());
    while (IsIdentifierChar(cursor_.Peek())) PepTextCursor::Append(token.text, cursor_.Take());
  }
  token.key = token.text;
  return token;
}

PepToken PepVerilogLexer::ReadDirectiveOrMacro() {
  cursor_.Skip(1);
  PepToken token;
  token.kind = PepToken::Kind::kMacro;
  token.text = "`";
  while (IsIdentifierChar(cursor_.Peek())) PepTextCursor::Append(token.text, cursor_.Take());
  if (SkipDirective(std::string_view(token.text).substr(1))) return Next();
  token.key = token.text;
  return token;
}

bool PepVerilogLexer::SkipDirective(std::string_view name) {
  static constexpr std::string_view kWithRestOfLine[] = {"include",
                                                         "timescale",
                                                         "default_nettype",
                                                         "undef",
                                                         "line",
                                                         "pragma",
                                                         "begin_keywords",
                                                         "unconnected_drive",
                                                         "default_decay_time",
                                                         "default_trireg_strength",
                                                         "delay_mode_distributed",
                                                         "delay_mode_path",
                                                         "delay_mode_unit",
                                                         "delay_mode_zero"};
  static constexpr std::string_view kWithMacroName[] = {"ifdef", "ifndef", "elsif"};
  static constexpr std::string_view kAlone[] = {
      "else",     "endif",        "celldefine",  "endcelldefine",
      "resetall", "end_keywords", "undefineall", "nounconnected_drive"};
  if (name == "define") {
    SkipDefineBody();
    return true;
  }
  for (std::string_view directive : kWithRestOfLine) {
    if (name == directive) {
      cursor_.SkipToLineEnd();
      return true;
    }
  }
  for (std::string_view directive : kWithMacroName) {
    if (name == directive) {
      while (PepChars::IsBlank(cursor_.Peek())) cursor_.Skip(1);
      while (IsIdentifierChar(cursor_.Peek())) cursor_.Skip(1);
      return true;
    }
  }
  for (std::string_view directive : kAlone) {
    if (name == directive) return true;
  }
  return false;
}

// A macro body runs to the end of the line; a backslash just before the line end continues it.
void PepVerilogLexer::SkipDefineBody() {
  while (!cursor_.AtEnd()) {
    char c = cursor_.Take();
    if (c == '\n') return;
    if (c == '\\' && cursor_.Peek() == '\r') cursor_.Skip(1);
    if (c == '\\' && cursor_.Peek() == '\n') cursor_.Skip(1);
  }
}

// Decimal (12, 1_000), sized and unsized based literals (8'hFF, 'd10, 4'sb1010) and reals
// (1.5, 2e3), which get no value; x and z digits leave the value unknown as well.
PepToken PepVerilogLexer::ReadNumber() {
  PepToken token;
  token.kind = PepToken::Kind::kNumber;
  std::string digits;
  while (PepChars::IsDigit(cursor_.Peek()) || cursor_.Peek() == '_') {
    char c = cursor_.Take();
    PepTextCursor::Append(token.text, c);
    PepTextCursor::Append(digits, c);
  }
  std::size_t blanks = digits.empty() ? 0 : cursor_.CountBlanksFrom(0);
  if (BasedPartFollows(blanks)) {
    cursor_.Skip(blanks);
    std::optional<std::int64_t> size;
    if (!digits.empty()) size = PepLiteral::DigitsValue(digits, 10);
    ReadBasedPart(token, size);
  } else if (RealPartFollows()) {
    ReadRealPart(token);
  } else {
    token.value = PepLiteral::DigitsValue(digits, 10);
  }
  token.key = token.text;
  return token;
}

bool PepVerilogLexer::RealPartFollows() const {
  char c = cursor_.Peek();
  char next = cursor_.Peek(1);
  if (c == '.') return PepChars::IsDigit(next);
  return (c == 'e' || c == 'E') && (PepChars::IsDigit(next) || next == '+' || next == '-');
}

void PepVerilogLexer::ReadRealPart(PepToken& token) {
  char previous = '\0';
  for (;;) {
    char c = cursor_.Peek();
    bool sign = (c == '+' || c == '-') && (previous == 'e' || previous == 'E');
    if (!PepChars::IsDigit(c) && c != '_' && c != '.' && c != 'e' && c != 'E' && !sign) return;
    PepTextCursor::Append(token.text, cursor_.Take());
    previous = c;
  }
}

bool PepVerilogLexer::BasedPartFollows(std::size_t ahead) const {
  if (cursor_.Peek(ahead) != '\'') return false;
  char next = cursor_.Peek(ahead + 1);
  if (next == 's' || next == 'S') next = cursor_.Peek(ahead + 2);
  return IsBaseLetter(next);
}

void PepVerilogLexer::ReadBasedPart(PepToken& token, std::optional<std::int64_t> size) {
  PepTextCursor::Append(token.text, cursor_.Take());
  if (cursor_.Peek() == 's' || cursor_.Peek() == 'S') PepTextCursor::Append(token.text, cursor_.Take());
  char baseLetter = cursor_.Take();
  PepTextCursor::Append(token.text, baseLetter);
  cursor_.Skip(cursor_.CountBlanksFrom(0));
  std::string digits;
  while (IsBasedDigit(cursor_.Peek())) {
    char c = cursor_.Take();
    PepTextCursor::Append(token.text, c);
    PepTextCursor::Append(digits, c);
  }
  std::optional<std::int64_t> value = PepLiteral::DigitsValue(digits, BaseOf(baseLetter));
  if (value && size && *size > 0 && *size < 63) value = *value & ((std::int64_t{1} << *size) - 1);
  token.value = value;
}

PepToken PepVerilogLexer::ReadString() {
  PepToken token;
  token.kind = PepToken::Kind::kString;
  PepTextCursor::Append(token.text, cursor_.Take());
  while (!cursor_.AtEnd() && cursor_.Peek() != '\n') {
    char c = cursor_.Take();
    PepTextCursor::Append(token.text, c);
    if (c == '\\' && !cursor_.AtEnd()) {
      PepTextCursor::Append(token.text, cursor_.Take());
    } else if (c == '"') {
      break;
    }
  }
  token.key = token.text;
  return token;
}

PepToken PepVerilogLexer::ReadSymbol() { return cursor_.TakeSymbol(kTwoCharacterSymbols); }
