// A name held by a component (a source library's name, a design unit's key).
#pragma once

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Prjrep {

class IName : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IName)
  virtual CitI::Result SetName(const Port::StringBase& name) = 0;
  // kInvalidArg for a null out-parameter.
  virtual CitI::Result GetName(Port::StringBase* out) = 0;
};

}  // namespace Prjrep
