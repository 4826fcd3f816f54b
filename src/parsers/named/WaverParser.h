// Waveform sources hold no design units.
#pragma once

#include "Parser.h"

namespace Vad {

class WaverParser : public Parser {
 public:
  // Records nothing; 0.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
