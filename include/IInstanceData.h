// What an instance knows about its place in the design.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Vad {

class IInstanceData : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IInstanceData)
  // Whether the instance lies inside a generate statement; kInvalidArg for a null out-parameter.
  virtual CitI::Result GetInGenerate(bool* out) = 0;
};

}  // namespace Vad
