// Where a design unit starts in its source text.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

// Null out-parameters give kInvalidArg.
class IHdlTextPosition : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlTextPosition)
  virtual CitI::Result GetLine(std::uint32_t* out) = 0;
  virtual CitI::Result GetColumn(std::uint32_t* out) = 0;
};

}  // namespace Vad
