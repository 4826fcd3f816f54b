// What the project derives from all its files together: the hierarchy, compile orders and
// ports of a design unit.
#pragma once

#include "CitI.h"
#include "HdlSets.h"
#include "Identifiers.h"

namespace Vad {

class IHdlDesignUnit;
class IHdlNetListNode;
class IHdlPortIterator;

class IHdlElaborationData : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlElaborationData)
  // Slot 2. Not provided: reports an error message and returns 0.
  virtual CitI::Result getUndefinedInstances() = 0;
  // Slot 3. The compile order of the whole project, or below `top` when it is given.
  virtual CitI::Result getCompileOrder(IHdlNetListNode* top, IHdlFileIterator** out) = 0;
  // Slot 4. The compile order for one design unit; 0 at once for a null unit or out-parameter.
  virtual CitI::Result getCompileOrderByDU(IHdlDesignUnit* unit, bool byUnit, IHdlFileIterator** out) = 0;
  // Slot 5. The unit's ports; kInvalidArg for a null out-parameter or a unit of another module.
  virtual CitI::Result getDesignUnitPorts(IHdlDesignUnit* unit, IHdlPortIterator** out) = 0;
  // Slot 6. The root of the instance hierarchy; kInvalidArg for a null out-parameter.
  virtual CitI::Result getHierarchyRoot(IHdlNetListNode** out) = 0;
};

}  // namespace Vad
