// Reads the tool suite's netlist databases; type slot 1 names the database format.
#pragma once

#include "Parser.h"

namespace Vad {

class PlxParser : public Parser {
 public:
  // This source kind is not read yet: records nothing and says so on the debug channel.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
