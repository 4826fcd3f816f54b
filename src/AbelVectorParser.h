// Reads ABEL test-vector sources through the ABEL converter's hierarchy output.
#pragma once

#include "Parser.h"

namespace Vad {

class AbelVectorParser : public Parser {
 public:
  // This source kind is not read yet: records nothing and says so on the debug channel.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
