// The host's file component that a source file may be linked to.
#pragma once

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

class IFile : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IFile)
  // kInvalidArg for a null out-parameter.
  virtual CitI::Result GetPath(Port::StringBase* out) = 0;
  virtual CitI::Result SetPath(const Port::StringBase& path) = 0;
};

}  // namespace Vad
