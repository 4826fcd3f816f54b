// Reads schematics through the schematic converter's hierarchy output.
#pragma once

#include "Parser.h"

namespace Vad {

class SchematicParser : public Parser {
 public:
  // Converts the schematic unless its output ("<base name>.hrf" in the directory of the file's
  // host location) is at least as new as the source, then reads the output with the hierarchy
  // grammar; without an output, records one module named after the file. Always 1.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
