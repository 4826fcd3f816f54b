// One named project property with its value as text, as the host hands it to a parser
// configuration.
#pragma once

#include "CitI.h"
#include "Port/StringBase.h"

namespace Vad {

// Null out-parameters give kInvalidArg.
class IPropertyInstance : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{3E3A320D-46B7-4D93-979D-5D501FD21FE7}")
  // Slot 2.
  virtual CitI::Result SetValue(const Port::StringBase& value) = 0;
  // Slot 3.
  virtual CitI::Result GetName(Port::StringBase* out) = 0;
  // Slot 4. The value as text.
  virtual CitI::Result GetValue(Port::StringBase* out) = 0;
  // Slot 5. kInvalidArg for an empty name.
  virtual CitI::Result SetName(const Port::StringBase& name) = 0;
};

}  // namespace Vad
