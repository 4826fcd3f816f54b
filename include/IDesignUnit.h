// The host's general view of a design unit: its type, free host text and transform bindings.
#pragma once

#include "CitI.h"
#include "IDesignUnitType.h"
#include "ITransformBindingInstance.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

class IDesignUnit : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IDesignUnit)
  // The unit's type from the host's design-unit type store, with one reference for the caller.
  virtual CitI::Result GetDesignUnitType(IDesignUnitType** out) = 0;
  // Not provided: stores null (when `out` is non-null) and returns kNotImpl.
  virtual CitI::Result GetDesignUnitView(CitI::IInterface** out) = 0;
  // kInvalidArg for a null out-parameter.
  virtual CitI::Result GetHostText(Port::StringBase* out) = 0;
  virtual CitI::Result SetHostText(const Port::StringBase& text) = 0;
  // The unit's own binding set with one reference for the caller; kNullOut for a null
  // out-parameter.
  virtual CitI::Result GetOutboundTransformBindings(ITransformBindingInstanceSet** out) = 0;
  // The bindings that the source file's host file component reports as a design unit; kNullOut
  // for a null out-parameter, 0 with `out` null when any link of that chain is missing.
  virtual CitI::Result GetReferencedTransformBindings(ITransformBindingInstanceSet** out) = 0;
};

}  // namespace Vad
