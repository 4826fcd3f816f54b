// The parser factory of the module: knows every parser kind and picks one by the holder's plug-in
// name. It sits above the parser kinds, so none of them needs the others; the module's entry
// installs it into the parse-result holders.
#pragma once

#include <memory>

#include "Parser.h"
#include "ParserFactory.h"
#include "Port/StringBase.h"

namespace Vad {

class PluginParserFactory final : public ParserFactory {
 public:
  bool Parse(CParserConfigHolder& holder) const override;
  void ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit, IHdlPortIterator** out) const override;
};

// The parser for the holder's plug-in name (compared exactly), owned by the caller; null only
// when allocation fails. An unknown name is reported on the debug channel and gets the generic
// parser. `edifSelection` (see GetEdifSelection) chooses among the EDIF parsers.
std::unique_ptr<Parser> CreateParser(const Port::StringBase& edifSelection, CParserConfigHolder& holder);
// The name of the first EDIF selection variable with a non-empty value, or empty.
void GetEdifSelection(Port::StringBase& selection);

}  // namespace Vad
