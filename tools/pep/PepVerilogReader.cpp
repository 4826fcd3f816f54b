#include "pep/PepVerilogReader.h"

#include "pep/PepTokenList.h"
#include "pep/PepVerilogDeclarations.h"
#include "pep/PepVerilogWords.h"

namespace {

constexpr std::string_view kStatementStops[] = {"endmodule", "module", "macromodule"};

// The name of a non-ANSI header item: "a", "a[3:0]" or ".a(b)"; none for a concatenation.
const PepToken* HeaderItemName(const PepTokens& item) {
  if (item.size() >= 2 && item[0].IsSymbol(".") && item[1].IsName()) return &item[1];
  if (!item.empty() && PepVerilogWords::IsIdentifier(item[0])) return &item[0];
  return nullptr;
}

bool StartsAnsiPort(const PepTokens& item) {
  if (item.empty()) return false;
  const PepToken& first = item.front();
  return PepVerilogWords::IsDirection(first) || PepVerilogWords::IsDataType(first) ||
         (item.size() >= 2 && PepVerilogWords::IsIdentifier(first) &&
          (item[1].IsName() || item[1].IsSymbol(".")) && !item[0].IsSymbol("."));
}

PepPortDeclaration* FindPort(PepDesignUnit& unit, const std::string& key) {
  for (PepPortDeclaration& port : unit.ports) {
    if (port.key == key) return &port;
  }
  return nullptr;
}

}  // namespace

void PepVerilogReader::Read() {
  while (!tokens_.AtEnd()) {
    if (AtModule()) {
      ReadModule();
    } else {
      tokens_.Take();
    }
  }
}

bool PepVerilogReader::AtModule() {
  return tokens_.Peek().IsWord("module") || tokens_.Peek().IsWord("macromodule");
}

void PepVerilogReader::ReadModule() {
  tokens_.Take();
  if (tokens_.Peek().IsWord("automatic") || tokens_.Peek().IsWord("static")) tokens_.Take();
  if (!PepVerilogWords::IsIdentifier(tokens_.Peek())) return;
  PepToken name = tokens_.Take();
  PepDesignUnit unit;
  unit.language = PepLanguage::kVerilog;
  unit.library = library_;
  unit.name = name.text;
  unit.key = name.key;
  while (tokens_.Peek().IsWord("import")) TakeStatement();
  bool hasParameterList = tokens_.Peek().IsSymbol("#") && tokens_.Peek(1).IsSymbol("(");
  if (hasParameterList) {
    tokens_.Take();
    PepVerilogDeclarations().ReadParameters(PepTokenList::Split(tokens_.TakeGroupContents(), ","), true,
                                            unit);
  }
  bool ansi = false;
  if (tokens_.Peek().IsSymbol("(")) ReadHeaderPorts(unit, ansi);
  ReadBody(unit, ansi, hasParameterList);
  catalog_.AddUnit(std::move(unit));
}

void PepVerilogReader::ReadHeaderPorts(PepDesignUnit& unit, bool& ansi) {
  std::vector<PepTokens> items = PepTokenList::Split(tokens_.TakeGroupContents(), ",");
  ansi = StartsAnsiPort(items.front());
  if (ansi) {
    unit.ports = PepVerilogDeclarations().ReadPorts(items);
    return;
  }
  for (const PepTokens& item : items) {
    const PepToken* name = HeaderItemName(item);
    if (name == nullptr) continue;
    PepPortDeclaration port;
    port.name = name->text;
    port.key = name->key;
    port.typeName = "wire";
    port.direction = PepPort::kDirectionInOut;
    unit.ports.push_back(std::move(port));
  }
}

// Runs to "endmodule", or to the next "module" when the end is missing.
void PepVerilogReader::ReadBody(PepDesignUnit& unit, bool ansi, bool hasParameterList) {
  while (!tokens_.AtEnd() && !AtModule()) {
    const PepToken& token = tokens_.Peek();
    if (token.IsWord("endmodule")) {
      tokens_.Take();
      return;
    }
    if (token.IsWord("parameter") || token.IsWord("localparam")) {
      // With a #(...) list, body parameters cannot be set from outside: they are local.
      PepVerilogDeclarations().ReadParameters(PepTokenList::Split(TakeStatement(), ","), !hasParameterList,
                                              unit);
    } else if (PepVerilogWords::IsDirection(token) && !ansi) {
      ReadBodyPortDeclaration(unit);
    } else if (PepVerilogWords::IsDataType(token) && !ansi) {
      ReadBodyNetDeclaration(unit);
    } else if (token.IsWord("function") || token.IsWord("task") || token.IsWord("specify")) {
      std::string endWord = "end" + token.key;
      SkipUntilWord(endWord);
    } else if (AtInstance()) {
      catalog_.AddReference({PepLanguage::kVerilog, unit.key, token.key});
      TakeStatement();
    } else {
      tokens_.Take();
    }
  }
}

void PepVerilogReader::ReadBodyPortDeclaration(PepDesignUnit& unit) {
  for (PepPortDeclaration& declared :
       PepVerilogDeclarations().ReadPorts(PepTokenList::Split(TakeStatement(), ","))) {
    PepPortDeclaration* port = FindPort(unit, declared.key);
    if (port == nullptr) continue;
    port->direction = declared.direction;
    port->typeName = declared.typeName;
    port->typeWritten = declared.typeWritten;
    port->range = std::move(declared.range);
  }
}

void PepVerilogReader::ReadBodyNetDeclaration(PepDesignUnit& unit) {
  for (PepPortDeclaration& declared :
       PepVerilogDeclarations().ReadPorts(PepTokenList::Split(TakeStatement(), ","))) {
    PepPortDeclaration* port = FindPort(unit, declared.key);
    if (port == nullptr || port->typeWritten) continue;
    port->typeName = declared.typeName;
    port->typeWritten = true;
    if (!port->range) port->range = std::move(declared.range);
  }
}

// "name [#(...)] instance (...)" or "name instance [...] (...)".
bool PepVerilogReader::AtInstance() {
  if (!PepVerilogWords::IsIdentifier(tokens_.Peek())) return false;
  const PepToken& next = tokens_.Peek(1);
  if (next.IsSymbol("#")) return true;
  if (!PepVerilogWords::IsIdentifier(next)) return false;
  return tokens_.Peek(2).IsSymbol("(") || tokens_.Peek(2).IsSymbol("[");
}

void PepVerilogReader::SkipUntilWord(std::string_view endWord) {
  while (!tokens_.AtEnd() && !tokens_.Peek().IsWord("endmodule")) {
    if (tokens_.Take().IsWord(endWord)) return;
  }
}

PepTokens PepVerilogReader::TakeStatement() { return tokens_.TakeStatement(";", kStatementStops); }
