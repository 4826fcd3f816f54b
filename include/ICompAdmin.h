// Component administration: what the host calls on a component right after creating it.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

class ICompAdmin : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::ICompAdmin)
  // Slot 2. `creator` is not used; `context` is the component's creation context.
  virtual CitI::Result InitializeAfterCreate(CitI::IInterface* creator, CitI::IInterface* context) = 0;
  // Slots 3 to 5: not provided; kNotImpl.
  virtual CitI::Result Reserved3() = 0;
  virtual CitI::Result Reserved4() = 0;
  virtual CitI::Result Reserved5() = 0;
};

}  // namespace Vad
