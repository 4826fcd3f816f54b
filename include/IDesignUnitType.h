// One kind of design unit as the host knows it: a type identifier seen in one file type.
#pragma once

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

// Null out-parameters give kInvalidArg.
class IDesignUnitType : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IDesignUnitType)
  virtual CitI::Result GetTypeId(Port::XUID* out) = 0;
  // The name given to the type identifier in the type store, else the identifier's text.
  virtual CitI::Result GetName(Port::StringBase* out) = 0;
  // The name of the file type the unit was found in.
  virtual CitI::Result GetFileTypeName(Port::StringBase* out) = 0;
};

}  // namespace Vad
