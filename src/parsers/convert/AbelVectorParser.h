// Reads ABEL test-vector sources through the ABEL converter's hierarchy output.
#pragma once

#include "Parser.h"

namespace Vad {

class AbelVectorParser : public Parser {
 public:
  // As AbelParser, but with type slots under which only entities, packages, instance labels and
  // test vectors record: the converter's module and architecture lines record nothing. Always 1.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
