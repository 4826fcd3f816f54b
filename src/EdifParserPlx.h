// Reads EDIF netlists through the netlist converter and the netlist database.
#pragma once

#include "Parser.h"

namespace Vad {

class EdifParserPlx : public Parser {
 public:
  // This source kind is not read yet: records nothing and says so on the debug channel.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
