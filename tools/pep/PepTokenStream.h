// Hands a lexer's tokens to a reader with a few tokens of look-ahead, and takes bracketed groups
// and statements whole. Brackets are ( [ { and their closers, counted as one kind of nesting.
// Tokens nested deeper than kMaxNesting, or past kMaxCapturedTokens in one group, are consumed
// but each run of them is replaced by one kOther token, so that no evaluation of them succeeds
// while memory stays bounded; nothing here recurses.
#pragma once

#include <cstddef>
#include <deque>
#include <span>
#include <string_view>

#include "pep/PepLexer.h"
#include "pep/PepToken.h"

class PepTokenStream {
 public:
  static constexpr int kMaxNesting = 256;
  static constexpr std::size_t kMaxCapturedTokens = std::size_t{1} << 20;

  // The lexer must outlive the stream.
  explicit PepTokenStream(PepLexer& lexer) : lexer_(lexer) {}

  // The token `ahead` places on (0: the next one); the end token past the end.
  const PepToken& Peek(std::size_t ahead = 0);
  PepToken Take();
  bool AtEnd() { return Peek().IsEnd(); }

  // At an opening bracket: consumes the group and returns the tokens inside it.
  PepTokens TakeGroupContents();
  // Consumes tokens through `terminator` outside brackets and returns those before it, brackets
  // included. Stops before any of `stopWords` outside brackets, and at the end of the text.
  PepTokens TakeStatement(std::string_view terminator, std::span<const std::string_view> stopWords);

  static bool IsOpener(const PepToken& token);
  static bool IsCloser(const PepToken& token);

 private:
  // At an opening bracket: appends the whole group, brackets included; true when it was closed.
  bool AppendGroup(PepTokens& out);
  static PepToken DroppedMarker();

  PepLexer& lexer_;
  std::deque<PepToken> lookahead_;
};
