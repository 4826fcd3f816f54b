// Reads EDIF netlists with the EDIF grammar.
#pragma once

#include "Parser.h"

namespace Vad {

class EdifParser : public Parser {
 public:
  // This source kind is not read yet: records nothing and says so on the debug channel.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
