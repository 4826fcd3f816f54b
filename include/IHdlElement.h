// A design unit's link to its source file.
#pragma once

#include "CitI.h"
#include "IHdlFile.h"
#include "Identifiers.h"

namespace Vad {

class IHdlElement : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlElement)
  // The unit's source file with one reference for the caller, or null when the unit has none;
  // kInvalidArg for a null out-parameter, else 1.
  virtual CitI::Result GetFile(IHdlFile** out) = 0;
  // The same as GetFile.
  virtual CitI::Result GetSourceFile(IHdlFile** out) = 0;
  // Not provided: stores null (when `out` is non-null) and returns kNotImpl.
  virtual CitI::Result GetView(CitI::IInterface** out) = 0;
  // Not provided: reports itself on standard output every time and answers false.
  virtual bool isValidInView() = 0;
};

}  // namespace Vad
