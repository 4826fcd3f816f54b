// Named text properties of a design unit, kept in byte order of their names.
#pragma once

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

class IHdlDUProperties : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlDUProperties)
  // Empties `out`; 0 for an empty or unknown key, else the value and 1. kInvalidArg for a null
  // out-parameter.
  virtual CitI::Result GetProperty(const Port::StringBase& key, Port::StringBase* out) = 0;
  // Inserts or replaces; 0 for an empty key.
  virtual CitI::Result SetProperty(const Port::StringBase& key, const Port::StringBase& value) = 0;
  // 0 for an empty or unknown key.
  virtual CitI::Result RemoveProperty(const Port::StringBase& key) = 0;
};

}  // namespace Vad
