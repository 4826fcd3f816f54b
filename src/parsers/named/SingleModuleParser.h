// A file of another tool that stands for one module, named after the file's base name: the
// single-module and the state-diagram sources.
#pragma once

#include "Parser.h"

namespace Vad {

class SingleModuleParser : public Parser {
 public:
  // Records the module; 1.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
