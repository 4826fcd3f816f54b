// Splits VHDL text into tokens. Comments (-- and /* */) and white space are dropped. Basic
// identifiers get their lower-case spelling as key; extended identifiers (\Name\) keep their
// backslashes and letter case. Unterminated strings and extended identifiers end at the end of the
// line, unterminated block comments at the end of the text.
#pragma once

#include <cstdint>
#include <string_view>

#include "pep/PepLexer.h"
#include "pep/PepTextCursor.h"

class PepVhdlLexer : public PepLexer {
 public:
  // `text` must outlive the lexer.
  explicit PepVhdlLexer(std::string_view text) : cursor_(text) {}

  PepToken Next() override;

 private:
  void SkipBlanksAndComments();
  PepToken ReadIdentifier();
  PepToken ReadExtendedIdentifier();
  PepToken ReadNumber();
  PepToken ReadQuoted(char quote);
  PepToken ReadSymbol();
  bool StartsCharacterLiteral() const;
  void ReadExponent(PepToken& token, std::int64_t base, bool isReal);

  PepTextCursor cursor_;
  // An apostrophe after a name or ')' marks an attribute, elsewhere it opens a character literal.
  bool previousEndsName_ = false;
};
