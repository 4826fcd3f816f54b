#include "pep/PepTokenStream.h"

const PepToken& PepTokenStream::Peek(std::size_t ahead) {
  while (lookahead_.size() <= ahead) {
    if (!lookahead_.empty() && lookahead_.back().IsEnd()) return lookahead_.back();
    lookahead_.push_back(lexer_.Next());
  }
  return lookahead_[ahead];
}

PepToken PepTokenStream::Take() {
  Peek();
  if (lookahead_.front().IsEnd()) return lookahead_.front();
  PepToken token = std::move(lookahead_.front());
  lookahead_.pop_front();
  return token;
}

bool PepTokenStream::IsOpener(const PepToken& token) {
  return token.IsSymbol("(") || token.IsSymbol("[") || token.IsSymbol("{");
}

bool PepTokenStream::IsCloser(const PepToken& token) {
  return token.IsSymbol(")") || token.IsSymbol("]") || token.IsSymbol("}");
}

bool PepTokenStream::AppendGroup(PepTokens& out) {
  const std::size_t start = out.size();
  out.push_back(Take());
  int depth = 1;
  bool dropping = false;
  while (!AtEnd()) {
    PepToken token = Take();
    int tokenDepth = depth;
    if (IsOpener(token)) tokenDepth = ++depth;
    if (IsCloser(token) && --depth == 0) {
      out.push_back(std::move(token));
      return true;
    }
    bool keep = tokenDepth <= kMaxNesting && out.size() - start < kMaxCapturedTokens;
    if (keep) {
      out.push_back(std::move(token));
    } else if (!dropping) {
      out.push_back(DroppedMarker());
    }
    dropping = !keep;
  }
  return false;
}

PepToken PepTokenStream::DroppedMarker() {
  PepToken marker;
  marker.kind = PepToken::Kind::kOther;
  marker.text = marker.key = "...";
  return marker;
}

PepTokens PepTokenStream::TakeGroupContents() {
  PepTokens group;
  bool closed = AppendGroup(group);
  if (closed) group.pop_back();
  group.erase(group.begin());
  return group;
}

PepTokens PepTokenStream::TakeStatement(std::string_view terminator,
                                        std::span<const std::string_view> stopWords) {
  PepTokens statement;
  while (!AtEnd()) {
    const PepToken& token = Peek();
    if (token.IsSymbol(terminator)) {
      Take();
      break;
    }
    for (std::string_view word : stopWords) {
      if (token.IsWord(word)) return statement;
    }
    if (IsOpener(token)) {
      AppendGroup(statement);
    } else if (IsCloser(token) || statement.size() >= kMaxCapturedTokens) {
      Take();
    } else {
      statement.push_back(Take());
    }
  }
  return statement;
}
