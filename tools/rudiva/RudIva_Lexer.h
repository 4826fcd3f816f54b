// Splits VHDL text into the tokens that the package reader needs: identifiers (basic and
// extended), literals and one-character delimiters; comments and white space are dropped. The
// text is read through a fixed-size buffer and over-long tokens are cut, so memory stays bounded
// whatever the input; unterminated comments, strings and extended identifiers end the token at
// the end of the line (strings, identifiers) or of the text (comments).
#pragma once

#include <cstddef>
#include <istream>
#include <string>
#include <string_view>
#include <vector>

class RudIva_Lexer {
 public:
  enum class Kind { kEnd, kIdentifier, kExtendedIdentifier, kString, kCharacter, kNumber, kDelimiter };

  struct Token {
    Kind kind = Kind::kEnd;
    // As written (extended identifiers with their backslashes), cut at kMaxTokenLength bytes.
    std::string text;

    // True for a basic identifier equal to `word` ignoring ASCII letter case.
    bool Is(std::string_view word) const;
    bool IsDelimiter(char c) const { return kind == Kind::kDelimiter && text.size() == 1 && text[0] == c; }
    // A basic identifier that is not a reserved word, or an extended identifier.
    bool IsName() const;
  };

  static constexpr std::size_t kMaxTokenLength = 1024;

  explicit RudIva_Lexer(std::istream& in);

  // The next token; kEnd at the end of the text (and on every call after it).
  Token Next();

  static bool IsReservedWord(std::string_view word);

 private:
  int Peek(std::size_t ahead = 0);
  int Get();
  bool Refill();

  void SkipLineComment();
  void SkipDelimitedComment();
  void ReadWhile(Token& token, bool (*accept)(int));
  void ReadQuoted(Token& token, char quote);
  bool StartsCharacterLiteral();
  static void Append(Token& token, int c);

  std::istream& in_;
  std::vector<char> buffer_;
  std::size_t position_ = 0;
  std::size_t filled_ = 0;
  bool exhausted_ = false;
  // Decides whether an apostrophe opens a character literal or is an attribute mark.
  bool previousEndsName_ = false;
};
