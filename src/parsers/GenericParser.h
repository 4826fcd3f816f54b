// The parser of the general plug-in and of every unknown plug-in name: the file stands for one
// generic unit named after it.
#pragma once

#include "Parser.h"

namespace Vad {

class GenericParser : public Parser {
 public:
  // Records one generic unit named after the file name (with extension) at line 0; 1.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
