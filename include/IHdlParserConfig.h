// A parser configuration: the project properties that parsers read by name. Its properties are
// reached through its IPropertyInstanceSet; this interface itself carries no behaviour.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

class IHdlParserConfig : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlParserConfig)
  // Slots 2 to 4: not provided; kNotImpl.
  virtual CitI::Result Reserved2() = 0;
  virtual CitI::Result Reserved3() = 0;
  virtual CitI::Result Reserved4() = 0;
};

}  // namespace Vad
