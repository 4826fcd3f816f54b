// An object that the host attaches to a design unit.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

class IHdlClientData : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlClientData)
  // The unit keeps a reference on `data` (null detaches) and releases the object held before. 1.
  virtual CitI::Result SetClientData(CitI::IInterface* data) = 0;
  // The attached object with one reference for the caller, or null; kInvalidArg for a null
  // out-parameter.
  virtual CitI::Result GetClientData(CitI::IInterface** out) = 0;
};

}  // namespace Vad
