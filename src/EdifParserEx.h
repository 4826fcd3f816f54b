// Reads EDIF netlists with the extended EDIF reader.
#pragma once

#include "EdifParser.h"

namespace Vad {

class EdifParserEx : public EdifParser {
 public:
  // This source kind is not read yet: records nothing and says so on the debug channel.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
