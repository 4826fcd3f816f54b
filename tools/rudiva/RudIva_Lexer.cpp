#include "rudiva/RudIva_Lexer.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace {

constexpr std::size_t kBufferSize = 64 * 1024;

// Sorted, lower case. The words reserved for the embedded property language are left out: cell
// libraries may use them as names.
constexpr std::array<std::string_view, 101> kReservedWords = {
    "abs",          "access",   "after",      "alias",     "all",       "and",
    "architecture", "array",    "assert",     "attribute", "begin",     "block",
    "body",         "buffer",   "bus",        "case",      "component", "configuration",
    "constant",     "context",  "disconnect", "downto",    "else",      "elsif",
    "end",          "entity",   "exit",       "file",      "for",       "force",
    "function",     "generate", "generic",    "group",     "guarded",   "if",
    "impure",       "in",       "inertial",   "inout",     "is",        "label",
    "library",      "linkage",  "literal",    "loop",      "map",       "mod",
    "nand",         "new",      "next",       "nor",       "not",       "null",
    "of",           "on",       "open",       "or",        "others",    "out",
    "package",      "port",     "postponed",  "procedure", "process",   "protected",
    "pure",         "range",    "record",     "register",  "reject",    "release",
    "rem",          "report",   "return",     "rol",       "ror",       "select",
    "severity",     "shared",   "signal",     "sla",       "sll",       "sra",
    "srl",          "subtype",  "then",       "to",        "transport", "type",
    "unaffected",   "units",    "until",      "use",       "variable",  "wait",
    "when",         "while",    "with",       "xnor",      "xor",
};

char ToLower(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }

bool IsLetter(int c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c >= 0x80; }
bool IsDigit(int c) { return c >= '0' && c <= '9'; }
bool IsIdentifierChar(int c) { return IsLetter(c) || IsDigit(c) || c == '_'; }
// Decimal, based and real literals; exponent signs become delimiters, which is harmless here.
bool IsNumberChar(int c) { return IsIdentifierChar(c) || c == '#' || c == '.'; }
bool IsSpace(int c) { return c >= 0 && (c <= ' ' || c == 0x7F); }

}  // namespace

bool RudIva_Lexer::Token::Is(std::string_view word) const {
  if (kind != Kind::kIdentifier || text.size() != word.size()) return false;
  return std::equal(text.begin(), text.end(), word.begin(),
                    [](char a, char b) { return ToLower(a) == ToLower(b); });
}

bool RudIva_Lexer::Token::IsName() const {
  return kind == Kind::kExtendedIdentifier || (kind == Kind::kIdentifier && !IsReservedWord(text));
}

bool RudIva_Lexer::IsReservedWord(std::string_view word) {
  if (word.size() > 16) return false;
  std::string lower(word);
  std::transform(lower.begin(), lower.end(), lower.begin(), ToLower);
  return std::binary_search(kReservedWords.begin(), kReservedWords.end(), lower);
}

RudIva_Lexer::RudIva_Lexer(std::istream& in) : in_(in), buffer_(kBufferSize) {}

bool RudIva_Lexer::Refill() {
  if (exhausted_) return false;
  std::size_t kept = filled_ - position_;
  std::memmove(buffer_.data(), buffer_.data() + position_, kept);
  position_ = 0;
  filled_ = kept;
  in_.read(buffer_.data() + filled_, static_cast<std::streamsize>(buffer_.size() - filled_));
  std::streamsize got = in_.gcount();
  if (got <= 0) {
    exhausted_ = true;
    return false;
  }
  filled_ += static_cast<std::size_t>(got);
  return true;
}

int RudIva_Lexer::Peek(std::size_t ahead) {
  while (position_ + ahead >= filled_) {
    if (!Refill()) return -1;
  }
  return static_cast<unsigned char>(buffer_[position_ + ahead]);
}

int RudIva_Lexer::Get() {
  int c = Peek();
  if (c >= 0) ++position_;
  return c;
}

void RudIva_Lexer::Append(Token& token, int c) {
  if (token.text.size() < kMaxTokenLength) token.text.push_back(static_cast<char>(c));
}

void RudIva_Lexer::SkipLineComment() {
  for (int c = Get(); c >= 0 && c != '\n'; c = Get()) {
  }
}

void RudIva_Lexer::SkipDelimitedComment() {
  Get();
  Get();
  for (int c = Get(); c >= 0; c = Get()) {
    if (c == '*' && Peek() == '/') {
      Get();
      return;
    }
  }
}

void RudIva_Lexer::ReadWhile(Token& token, bool (*accept)(int)) {
  while (accept(Peek())) Append(token, Get());
}

// A doubled quote stands for one quote character inside; a line end closes an unterminated one.
void RudIva_Lexer::ReadQuoted(Token& token, char quote) {
  Append(token, Get());
  for (int c = Peek(); c >= 0 && c != '\n'; c = Peek()) {
    Append(token, Get());
    if (c == quote) {
      if (Peek() != quote) return;
      Append(token, Get());
    }
  }
}

// After a name or a closing bracket an apostrophe marks an attribute or a qualified expression
// ("width'high", "bit'('1')"); elsewhere it opens a character literal such as ')' or ';'.
bool RudIva_Lexer::StartsCharacterLiteral() { return !previousEndsName_ && Peek(2) == '\''; }

RudIva_Lexer::Token RudIva_Lexer::Next() {
  Token token;
  for (;;) {
    int c = Peek();
    if (c < 0) return token;
    if (IsSpace(c)) {
      Get();
    } else if (c == '-' && Peek(1) == '-') {
      SkipLineComment();
    } else if (c == '/' && Peek(1) == '*') {
      SkipDelimitedComment();
    } else {
      break;
    }
  }
  int c = Peek();
  if (IsLetter(c)) {
    token.kind = Kind::kIdentifier;
    ReadWhile(token, IsIdentifierChar);
  } else if (IsDigit(c)) {
    token.kind = Kind::kNumber;
    ReadWhile(token, IsNumberChar);
  } else if (c == '"') {
    token.kind = Kind::kString;
    ReadQuoted(token, '"');
  } else if (c == '\\') {
    token.kind = Kind::kExtendedIdentifier;
    ReadQuoted(token, '\\');
  } else if (c == '\'' && StartsCharacterLiteral()) {
    token.kind = Kind::kCharacter;
    for (int i = 0; i < 3; ++i) Append(token, Get());
  } else {
    token.kind = Kind::kDelimiter;
    Append(token, Get());
  }
  previousEndsName_ = (token.kind == Kind::kIdentifier && (!IsReservedWord(token.text) || token.Is("all"))) ||
                      token.kind == Kind::kExtendedIdentifier || token.IsDelimiter(')') ||
                      token.IsDelimiter(']');
  return token;
}
