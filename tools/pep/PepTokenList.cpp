#include "pep/PepTokenList.h"

#include <algorithm>

#include "pep/PepTokenStream.h"

namespace {

template <class Matches>
std::size_t FindOutsideBrackets(const PepTokens& tokens, std::size_t from, Matches matches) {
  int depth = 0;
  for (std::size_t i = from; i < tokens.size(); ++i) {
    if (depth == 0 && matches(tokens[i])) return i;
    if (PepTokenStream::IsOpener(tokens[i])) ++depth;
    if (PepTokenStream::IsCloser(tokens[i]) && depth > 0) --depth;
  }
  return PepTokenList::kNotFound;
}

}  // namespace

std::vector<PepTokens> PepTokenList::Split(const PepTokens& tokens, std::string_view separator) {
  std::vector<PepTokens> pieces;
  std::size_t start = 0;
  for (;;) {
    std::size_t end = FindSymbol(tokens, separator, start);
    if (end == kNotFound) break;
    pieces.push_back(Slice(tokens, start, end));
    start = end + 1;
  }
  pieces.push_back(Slice(tokens, start, tokens.size()));
  return pieces;
}

std::size_t PepTokenList::FindSymbol(const PepTokens& tokens, std::string_view symbol, std::size_t from) {
  return FindOutsideBrackets(tokens, from, [&](const PepToken& token) { return token.IsSymbol(symbol); });
}

std::size_t PepTokenList::FindWord(const PepTokens& tokens, std::string_view word, std::size_t from) {
  return FindOutsideBrackets(tokens, from, [&](const PepToken& token) { return token.IsWord(word); });
}

std::size_t PepTokenList::FindRangeColon(const PepTokens& tokens) {
  int openConditionals = 0;
  return FindOutsideBrackets(tokens, 0, [&](const PepToken& token) {
    if (token.IsSymbol("?")) {
      ++openConditionals;
    } else if (token.IsSymbol(":")) {
      if (openConditionals == 0) return true;
      --openConditionals;
    }
    return false;
  });
}

PepTokens PepTokenList::Slice(const PepTokens& tokens, std::size_t first, std::size_t last) {
  last = std::min(last, tokens.size());
  if (first >= last) return {};
  return PepTokens(tokens.begin() + static_cast<std::ptrdiff_t>(first),
                   tokens.begin() + static_cast<std::ptrdiff_t>(last));
}

std::size_t PepTokenList::SkipGroup(const PepTokens& tokens, std::size_t open) {
  int depth = 0;
  for (std::size_t i = open; i < tokens.size(); ++i) {
    if (PepTokenStream::IsOpener(tokens[i])) ++depth;
    if (PepTokenStream::IsCloser(tokens[i]) && --depth <= 0) return i + 1;
  }
  return tokens.size();
}

std::string PepTokenList::JoinedText(const PepTokens& tokens, std::size_t first, std::size_t last) {
  std::string text;
  for (std::size_t i = first; i < std::min(last, tokens.size()); ++i) text += tokens[i].text;
  return text;
}
