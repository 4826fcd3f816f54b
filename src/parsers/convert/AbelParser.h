// Reads ABEL sources through the ABEL converter's hierarchy output.
#pragma once

#include "Parser.h"

namespace Vad {

class AbelParser : public Parser {
 public:
  // Converts the source in its own directory and reads the converter's output with the
  // hierarchy grammar, with the holder's type slots as they are. Always 1.
  int Parse(CParserConfigHolder& holder) override;
};

// The conversion and read shared by the ABEL parsers: the source's directory is the current one
// while the converter runs and its output ("<base name>.hrf") is read. A failing converter is
// reported and an earlier output is still read.
void ReadThroughAbelConverter(CParserConfigHolder& holder);

}  // namespace Vad
