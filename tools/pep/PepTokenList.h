// Searches and splits of captured token lists at the outermost bracket level.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "pep/PepToken.h"

namespace PepTokenList {

constexpr std::size_t kNotFound = static_cast<std::size_t>(-1);

// The pieces between `separator` symbols outside brackets; empty pieces are kept.
std::vector<PepTokens> Split(const PepTokens& tokens, std::string_view separator);
// The index of the first token from `from` on, outside brackets, that is the symbol `symbol` or
// the word `word`; kNotFound when there is none.
std::size_t FindSymbol(const PepTokens& tokens, std::string_view symbol, std::size_t from = 0);
std::size_t FindWord(const PepTokens& tokens, std::string_view word, std::size_t from = 0);
// The first ':' outside brackets that closes no '?' before it: the bound separator of a Verilog
// range such as [W > 8 ? W - 1 : 7 : 0]; kNotFound when there is none.
std::size_t FindRangeColon(const PepTokens& tokens);
// tokens[first, last) as a new list (clamped to the list).
PepTokens Slice(const PepTokens& tokens, std::size_t first, std::size_t last);
// The index just past the bracketed group that opens at `open` (tokens.size() when unclosed).
std::size_t SkipGroup(const PepTokens& tokens, std::size_t open);
// The texts of tokens[first, last) joined without spaces ("work.pkg.word_t").
std::string JoinedText(const PepTokens& tokens, std::size_t first, std::size_t last);

}  // namespace PepTokenList
