// The host's base services: the entry point to its process-wide services.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

class IBaseServices : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IBaseServices)
  // The service named by `service` (e.g. InterfaceIds::DataStoreService) with one reference for
  // the caller. kFail with *out null for a service the host does not offer; kInvalidArg for a
  // null out-parameter.
  virtual CitI::Result GetService(const Port::XUID& service, CitI::IInterface** out) = 0;
};

}  // namespace Vad
