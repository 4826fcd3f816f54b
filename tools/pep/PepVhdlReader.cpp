#include "pep/PepVhdlReader.h"

#include "pep/PepPort.h"
#include "pep/PepTokenList.h"
#include "pep/PepVhdlSubtype.h"

namespace {

// Generics that are types, subprograms or packages (VHDL-2008) carry no value to evaluate.
bool DeclaresNoValue(const PepToken& first) {
  for (std::string_view word : {"type", "function", "procedure", "impure", "pure", "package"}) {
    if (first.IsWord(word)) return true;
  }
  return false;
}

// buffer writes like out, linkage is read as inout; no mode is in.
int DirectionOfMode(const PepToken& token, bool& isMode) {
  isMode = true;
  if (token.IsWord("in")) return PepPort::kDirectionIn;
  if (token.IsWord("out") || token.IsWord("buffer")) return PepPort::kDirectionOut;
  if (token.IsWord("inout") || token.IsWord("linkage")) return PepPort::kDirectionInOut;
  isMode = false;
  return PepPort::kDirectionIn;
}

// The names before the ':' of an interface declaration; none when they are not a name list.
std::vector<const PepToken*> DeclaredNames(const PepTokens& declaration, std::size_t colon) {
  std::vector<const PepToken*> names;
  for (const PepTokens& piece : PepTokenList::Split(PepTokenList::Slice(declaration, 0, colon), ",")) {
    if (piece.size() != 1 || !piece.front().IsName()) return {};
  }
  for (std::size_t i = 0; i < colon; i += 2) names.push_back(&declaration[i]);
  return names;
}

}  // namespace

void PepVhdlReader::Read() {
  while (!tokens_.AtEnd()) {
    const PepToken& token = tokens_.Peek();
    if (AtEntityDeclaration()) {
      ReadEntity();
    } else if (AtSecondaryUnitHeader()) {
      ownerKey_ = tokens_.Peek(3).key;
      for (int i = 0; i < 4; ++i) tokens_.Take();
    } else if (token.IsSymbol(":") || (token.IsWord("use") && tokens_.Peek(1).IsWord("entity"))) {
      ReadInstantiation(1);
      tokens_.Take();
    } else {
      tokens_.Take();
    }
  }
}

bool PepVhdlReader::AtEntityDeclaration() {
  return tokens_.Peek().IsWord("entity") && tokens_.Peek(1).IsName() && tokens_.Peek(2).IsWord("is");
}

// "architecture A of E" or "configuration C of E".
bool PepVhdlReader::AtSecondaryUnitHeader() {
  const PepToken& first = tokens_.Peek();
  return (first.IsWord("architecture") || first.IsWord("configuration")) && tokens_.Peek(1).IsName() &&
         tokens_.Peek(2).IsWord("of") && tokens_.Peek(3).IsName();
}

void PepVhdlReader::ReadEntity() {
  tokens_.Take();
  PepToken name = tokens_.Take();
  tokens_.Take();
  PepDesignUnit unit;
  unit.language = PepLanguage::kVhdl;
  unit.library = library_;
  unit.name = name.text;
  unit.key = name.key;
  ownerKey_ = name.key;
  while (!tokens_.AtEnd() && !AtEntityDeclaration()) {
    const PepToken& token = tokens_.Peek();
    if (token.IsWord("end")) break;
    if (token.IsWord("generic") && tokens_.Peek(1).IsSymbol("(")) {
      ReadGenericClause(unit);
    } else if (token.IsWord("port") && tokens_.Peek(1).IsSymbol("(")) {
      ReadPortClause(unit);
    } else {
      tokens_.Take();
    }
  }
  catalog_.AddUnit(std::move(unit));
}

void PepVhdlReader::ReadGenericClause(PepDesignUnit& unit) {
  tokens_.Take();
  for (const PepTokens& declaration : PepTokenList::Split(tokens_.TakeGroupContents(), ";")) {
    ReadGenericDeclaration(declaration, unit);
  }
}

void PepVhdlReader::ReadPortClause(PepDesignUnit& unit) {
  tokens_.Take();
  for (const PepTokens& declaration : PepTokenList::Split(tokens_.TakeGroupContents(), ";")) {
    ReadPortDeclaration(declaration, unit);
  }
}

// [constant] names : [in] subtype_indication [:= default]
void PepVhdlReader::ReadGenericDeclaration(const PepTokens& declaration, PepDesignUnit& unit) {
  std::size_t first = !declaration.empty() && declaration.front().IsWord("constant") ? 1 : 0;
  if (declaration.size() <= first || DeclaresNoValue(declaration[first])) return;
  PepTokens rest = PepTokenList::Slice(declaration, first, declaration.size());
  std::size_t colon = PepTokenList::FindSymbol(rest, ":");
  if (colon == PepTokenList::kNotFound) return;
  std::size_t typeStart = colon + 1;
  if (typeStart < rest.size() && rest[typeStart].IsWord("in")) ++typeStart;
  std::size_t assignment = PepTokenList::FindSymbol(rest, ":=", typeStart);
  PepVhdlSubtype subtype = PepVhdlSubtype::Read(PepTokenList::Slice(rest, typeStart, assignment));
  for (const PepToken* name : DeclaredNames(rest, colon)) {
    PepConstant constant;
    constant.name = name->text;
    constant.key = name->key;
    constant.needsValue = subtype.IsIntegerType();
    if (assignment != PepTokenList::kNotFound) {
      constant.defaultValue = PepTokenList::Slice(rest, assignment + 1, rest.size());
      constant.hasDefault = !constant.defaultValue.empty();
    }
    unit.constants.push_back(std::move(constant));
  }
}

// [signal] names : [mode] subtype_indication [bus] [:= default]
void PepVhdlReader::ReadPortDeclaration(const PepTokens& declaration, PepDesignUnit& unit) {
  std::size_t first = !declaration.empty() && declaration.front().IsWord("signal") ? 1 : 0;
  PepTokens rest = PepTokenList::Slice(declaration, first, declaration.size());
  std::size_t colon = PepTokenList::FindSymbol(rest, ":");
  if (colon == PepTokenList::kNotFound) return;
  std::size_t typeStart = colon + 1;
  bool isMode = false;
  int direction = typeStart < rest.size() ? DirectionOfMode(rest[typeStart], isMode) : PepPort::kDirectionIn;
  if (isMode) ++typeStart;
  std::size_t typeEnd = PepTokenList::FindSymbol(rest, ":=", typeStart);
  PepVhdlSubtype subtype = PepVhdlSubtype::Read(PepTokenList::Slice(rest, typeStart, typeEnd));
  for (const PepToken* name : DeclaredNames(rest, colon)) {
    PepPortDeclaration port;
    port.name = name->text;
    port.key = name->key;
    port.typeName = subtype.typeMark;
    port.direction = direction;
    port.range = subtype.range;
    unit.ports.push_back(std::move(port));
  }
}

void PepVhdlReader::ReadInstantiation(std::size_t nameAt) {
  bool isEntity = tokens_.Peek(nameAt).IsWord("entity");
  bool isComponent = tokens_.Peek(nameAt).IsWord("component");
  if (isEntity || isComponent) ++nameAt;
  if (!tokens_.Peek(nameAt).IsName()) return;
  std::size_t end = nameAt;
  std::string key = DottedNameKey(nameAt, end);
  bool mapFollows = (tokens_.Peek(end).IsWord("generic") || tokens_.Peek(end).IsWord("port")) &&
                    tokens_.Peek(end + 1).IsWord("map");
  if (isEntity || isComponent || mapFollows) Record(key);
}

std::string PepVhdlReader::DottedNameKey(std::size_t at, std::size_t& end) {
  constexpr std::size_t kMaxSegments = 8;
  std::string key = tokens_.Peek(at).key;
  end = at + 1;
  for (std::size_t segment = 1; segment < kMaxSegments; ++segment) {
    if (!tokens_.Peek(end).IsSymbol(".") || !tokens_.Peek(end + 1).IsName()) break;
    key = tokens_.Peek(end + 1).key;
    end += 2;
  }
  return key;
}

void PepVhdlReader::Record(const std::string& unitKey) {
  catalog_.AddReference({PepLanguage::kVhdl, ownerKey_, unitKey});
}
