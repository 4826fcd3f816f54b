// How a parse-result holder gets the parser of its file's plug-in name. The parsers sit in the
// layer above the project (they record into the holder), so the module's entry installs the one
// factory that knows them all (CParserConfigHolder::InstallParserFactory) before any file is made.
#pragma once

#include "CitI.h"

namespace Vad {

class CParserConfigHolder;
class IHdlDesignUnit;
class IHdlPortIterator;

class ParserFactory {
 public:
  // Reads the holder's file with the parser of its plug-in name into the holder; false when no
  // parser could be made.
  virtual bool Parse(CParserConfigHolder& holder) const = 0;
  // Has that parser fill the port set of one unit of the holder's file; its result is not used.
  virtual void ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                            IHdlPortIterator** out) const = 0;

 protected:
  ParserFactory() = default;
  ParserFactory(const ParserFactory&) = default;
  ParserFactory& operator=(const ParserFactory&) = default;
  virtual ~ParserFactory() = default;
};

}  // namespace Vad
