// The link from a source file to the host's file component.
#pragma once

#include "CitI.h"
#include "IFile.h"
#include "Identifiers.h"

namespace Vad {

class IFileCompReference : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IFileCompReference)
  // Keeps the object's IFile (null when it has none); 1.
  virtual CitI::Result setFileComponent(CitI::IInterface* file) = 0;
  // The file component with one reference for the caller, or null. A null out-parameter is
  // accepted: only the result is returned.
  virtual CitI::Result getFileComponent(IFile** out) = 0;
};

}  // namespace Vad
