#include "pep/PepVerilogDeclarations.h"

#include "pep/PepTokenList.h"
#include "pep/PepVerilogWords.h"

namespace {

constexpr std::string_view kImplicitType = "wire";

bool IsSignedness(const PepToken& token) { return token.IsWord("signed") || token.IsWord("unsigned"); }

// A string or real literal standing alone: a value, though not an integer one.
bool IsNonIntegerLiteral(const PepTokens& value) {
  if (value.size() != 1) return false;
  const PepToken& token = value.front();
  if (token.kind == PepToken::Kind::kString) return true;
  return token.kind == PepToken::Kind::kNumber && !token.value && token.text.find('\'') == std::string::npos;
}

// A user-defined type or an interface port ("word_t a", "bus_if.master m"): where its name ends,
// or `at` when there is none.
std::size_t SkipUserType(const PepTokens& item, std::size_t at) {
  std::size_t end = at + 1;
  if (end + 1 < item.size() && item[end].IsSymbol(".") && item[end + 1].IsName()) end += 2;
  if (end < item.size() && PepVerilogWords::IsIdentifier(item[at]) && item[end].IsName()) return end;
  return at;
}

}  // namespace

std::vector<PepPortDeclaration> PepVerilogDeclarations::ReadPorts(const std::vector<PepTokens>& items) {
  std::vector<PepPortDeclaration> ports;
  for (const PepTokens& item : items) {
    if (std::optional<PepPortDeclaration> port = ReadPortItem(item)) ports.push_back(std::move(*port));
  }
  return ports;
}

std::optional<PepPortDeclaration> PepVerilogDeclarations::ReadPortItem(const PepTokens& item) {
  std::size_t at = 0;
  bool directionWritten = at < item.size() && PepVerilogWords::IsDirection(item[at]);
  if (directionWritten) direction_ = PepVerilogWords::DirectionOf(item[at++]);
  std::string type;
  bool rangeWritten = false;
  std::optional<PepRangeExpression> range;
  while (at < item.size()) {
    if (PepVerilogWords::IsDataType(item[at])) {
      if (type.empty() && !item[at].IsWord("var")) type = item[at].text;
      if (type.empty()) type = "logic";  // "var" alone declares a logic variable
      ++at;
    } else if (IsSignedness(item[at])) {
      ++at;
    } else if (item[at].IsSymbol("[")) {
      if (!rangeWritten) range = ReadPackedRange(item, at);
      rangeWritten = true;
      at = PepTokenList::SkipGroup(item, at);
    } else if (std::size_t end = SkipUserType(item, at); end != at) {
      type = PepTokenList::JoinedText(item, at, end);
      at = end;
    } else {
      break;
    }
  }
  if (at >= item.size() || !PepVerilogWords::IsIdentifier(item[at])) return std::nullopt;
  if (directionWritten || !type.empty() || rangeWritten) {
    typeWritten_ = !type.empty();
    typeName_ = typeWritten_ ? type : std::string(kImplicitType);
    range_ = range;
  }
  PepPortDeclaration port;
  port.name = item[at].text;
  port.key = item[at].key;
  port.typeName = typeName_;
  port.direction = direction_;
  port.range = range_;
  port.typeWritten = typeWritten_;
  return port;
}

void PepVerilogDeclarations::ReadParameters(const std::vector<PepTokens>& items, bool parameterIsGeneric,
                                            PepDesignUnit& unit) {
  for (const PepTokens& item : items) ReadParameterItem(item, parameterIsGeneric, unit);
}

void PepVerilogDeclarations::ReadParameterItem(const PepTokens& item, bool parameterIsGeneric,
                                               PepDesignUnit& unit) {
  std::size_t at = 0;
  if (at < item.size() && (item[at].IsWord("parameter") || item[at].IsWord("localparam"))) {
    isGeneric_ = item[at].IsWord("parameter") && parameterIsGeneric;
    needsValue_ = true;
    ++at;
  }
  bool typeWritten = false;
  while (at < item.size()) {
    if (item[at].IsWord("type") || PepVerilogWords::IsDataType(item[at])) {
      if (!typeWritten) needsValue_ = true;
      typeWritten = true;
      if (item[at].IsWord("type") || PepVerilogWords::IsNonIntegerType(item[at])) needsValue_ = false;
      ++at;
    } else if (IsSignedness(item[at])) {
      ++at;
    } else if (item[at].IsSymbol("[")) {
      at = PepTokenList::SkipGroup(item, at);
    } else if (std::size_t end = SkipUserType(item, at); end != at) {
      needsValue_ = false;  // an enumeration or other user type: a default is all it needs
      at = end;
    } else {
      break;
    }
  }
  if (at >= item.size() || !PepVerilogWords::IsIdentifier(item[at])) return;
  PepConstant constant;
  constant.name = item[at].text;
  constant.key = item[at].key;
  constant.isGeneric = isGeneric_;
  std::size_t assignment = PepTokenList::FindSymbol(item, "=", at + 1);
  if (assignment != PepTokenList::kNotFound) {
    constant.defaultValue = PepTokenList::Slice(item, assignment + 1, item.size());
    constant.hasDefault = !constant.defaultValue.empty();
  }
  constant.needsValue = needsValue_ && !IsNonIntegerLiteral(constant.defaultValue);
  unit.constants.push_back(std::move(constant));
}

PepRangeExpression PepVerilogDeclarations::ReadPackedRange(const PepTokens& tokens, std::size_t open) {
  std::size_t end = PepTokenList::SkipGroup(tokens, open);
  PepTokens inside = PepTokenList::Slice(tokens, open + 1, end - 1);
  const std::size_t colon = PepTokenList::FindRangeColon(inside);
  if (colon == PepTokenList::kNotFound) return {};
  PepTokens right = PepTokenList::Slice(inside, colon + 1, inside.size());
  if (PepTokenList::FindRangeColon(right) != PepTokenList::kNotFound) return {};
  return {PepTokenList::Slice(inside, 0, colon), std::move(right)};
}
