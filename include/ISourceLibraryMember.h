// A component that is compiled into a source library (the source files).
#pragma once

#include "CitI.h"
#include "ISourceLibrary.h"
#include "Identifiers.h"

namespace Vad {

class ISourceLibraryMember : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::ISourceLibraryMember)
  // The library with one reference for the caller (null when there is none); kInvalidArg for a
  // null out-parameter.
  virtual CitI::Result getSourceLibrary(ISourceLibrary** out) = 0;
  // Keeps the object's ISourceLibrary (null when it has none); 1.
  virtual CitI::Result setSourceLibrary(CitI::IInterface* library) = 0;
};

}  // namespace Vad
