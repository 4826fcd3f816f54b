// Where a design unit is drawn.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

// Null out-parameters give kInvalidArg.
class IHdlGraphicsPosition : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlGraphicsPosition)
  virtual CitI::Result GetX(std::uint32_t* out) = 0;
  virtual CitI::Result GetY(std::uint32_t* out) = 0;
};

}  // namespace Vad
