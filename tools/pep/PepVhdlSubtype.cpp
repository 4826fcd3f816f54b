#include "pep/PepVhdlSubtype.h"

#include "pep/PepTokenList.h"
#include "pep/PepUnitCatalog.h"

namespace {

// "L to R" or "L downto R" outside brackets; a range that cannot be split has empty bounds, which
// never evaluate.
PepRangeExpression SplitRange(const PepTokens& tokens) {
  std::size_t direction = PepTokenList::FindWord(tokens, "downto");
  if (direction == PepTokenList::kNotFound) direction = PepTokenList::FindWord(tokens, "to");
  if (direction == PepTokenList::kNotFound) return {};
  return {PepTokenList::Slice(tokens, 0, direction),
          PepTokenList::Slice(tokens, direction + 1, tokens.size())};
}

}  // namespace

PepVhdlSubtype PepVhdlSubtype::Read(const PepTokens& indication) {
  PepVhdlSubtype subtype;
  std::size_t at = 0;
  if (at < indication.size() && indication[at].IsSymbol("(")) at = PepTokenList::SkipGroup(indication, at);
  // Two names in a row: the first is a resolution function.
  if (at + 1 < indication.size() && indication[at].IsName() && indication[at + 1].IsName() &&
      !indication[at + 1].IsWord("range")) {
    ++at;
  }
  std::size_t markStart = at;
  while (at < indication.size() && indication[at].IsName() && !indication[at].IsWord("range")) {
    ++at;
    if (at < indication.size() && indication[at].IsSymbol(".")) {
      ++at;
    } else {
      break;
    }
  }
  subtype.typeMark = PepTokenList::JoinedText(indication, markStart, at);
  subtype.typeMarkKey = PepUnitCatalog::Folded(subtype.typeMark);
  if (at < indication.size() && indication[at].IsSymbol("(")) {
    std::size_t end = PepTokenList::SkipGroup(indication, at);
    PepTokens inside = PepTokenList::Slice(indication, at + 1, end - 1);
    subtype.range = SplitRange(PepTokenList::Split(inside, ",").front());
  } else if (at < indication.size() && indication[at].IsWord("range")) {
    subtype.hasRangeConstraint = true;
    subtype.range = SplitRange(PepTokenList::Slice(indication, at + 1, indication.size()));
  }
  return subtype;
}

bool PepVhdlSubtype::IsIntegerType() const {
  return hasRangeConstraint || typeMarkKey == "integer" || typeMarkKey == "natural" ||
         typeMarkKey == "positive";
}
