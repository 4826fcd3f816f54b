// A file associated with the project that stands for one module named after the whole file
// name ("base.ext").
#pragma once

#include "Parser.h"

namespace Vad {

class AssocModuleParser : public Parser {
 public:
  // Records the module; 1.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
