// The host's source library, into which source files are compiled. It answers Prjrep::IName
// with the same name.
#pragma once

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

class ISourceLibrary : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::ISourceLibrary)
  // kInvalidArg for a null out-parameter.
  virtual CitI::Result GetName(Port::StringBase* out) = 0;
  virtual CitI::Result SetName(const Port::StringBase& name) = 0;
};

}  // namespace Vad
