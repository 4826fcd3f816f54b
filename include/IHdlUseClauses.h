// The use clauses in effect for a VHDL design unit (entity, architecture, package declaration,
// package body), which the records keep in memory but never persist. Answered by those units only.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

class IHdlUseClauses : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IHdlUseClauses)
  // kInvalidArg for a null out-parameter.
  virtual CitI::Result GetUseCount(std::uint32_t* count) = 0;
  // The store key of the use record at `index`, in source order; kInvalidArg for a null
  // out-parameter or an index past the end.
  virtual CitI::Result GetUseStoreKey(std::uint32_t index, Port::StringBase* key) = 0;
};

}  // namespace Vad
