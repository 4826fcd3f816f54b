// Transform bindings of a design unit: host objects that the module only hands on, in a set.
#pragma once

#include "CitI.h"
#include "Prjrep/ISet.h"

namespace Vad {

class ITransformBindingInstance : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{B3B4F598-4BEF-40C6-A32D-DE59DF210F6F}")
};

class ITransformBindingInstanceIterator : public Prjrep::IIteratorOf<ITransformBindingInstance> {
 public:
  QUILLON_INTERFACE_ID("{DC0CD018-1D48-4C15-9A85-9D05AC6A8042}")
};

class ITransformBindingInstanceSet
    : public Prjrep::ISetOf<ITransformBindingInstance, ITransformBindingInstanceIterator> {
 public:
  QUILLON_INTERFACE_ID("{4CBEA3C4-0D46-4EF6-9D10-E963C514D1F6}")
};

}  // namespace Vad
