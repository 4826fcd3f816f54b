// A design unit as the host sees it: the unit's own face, its unit flag and its type identifier.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

class IHdlDesignUnit : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlDesignUnit)
  // This face with one reference for the caller when `out` is non-null; `context` is not used.
  // Always 1.
  virtual CitI::Result GetDesignUnit(CitI::IInterface* context, IHdlDesignUnit** out) = 0;
  // The unit flag of an entity or module, or of an architecture's entity (`flag` is passed on to
  // the entity look-up). 0 for a null out-parameter; 4, leaving `out` alone, for other kinds; an
  // architecture whose entity is not found gives the look-up's result and leaves `out` alone.
  virtual CitI::Result GetUnitFlag(std::int32_t flag, bool* out) = 0;
  // kInvalidArg for a null out-parameter.
  virtual CitI::Result GetDesignUnitTypeId(Port::XUID* out) = 0;
};

}  // namespace Vad
