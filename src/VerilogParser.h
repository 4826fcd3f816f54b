// Reads Verilog source files through the Verilog data compiler.
#pragma once

#include "Parser.h"

namespace Vad {

class VerilogParser : public Parser {
 public:
  // This source kind is not read yet: records nothing and says so on the debug channel.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
