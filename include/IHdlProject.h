// The HDL side of a design project (CHdlProject). The project also answers IHdlFileSet (its
// source files, keyed by full path) and IHdlElaborationData.
#pragma once

#include "CitI.h"
#include "HdlSets.h"
#include "IHdlFile.h"
#include "IHdlParserConfig.h"
#include "Identifiers.h"

namespace Vad {

// Null out-parameters give kInvalidArg.
class IHdlProject : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlProject)
  // Slots 2 and 3: no behaviour; 1.
  virtual CitI::Result Reserved2() = 0;
  virtual CitI::Result Reserved3() = 0;
  // Slot 4. Brings every file up to date and collects its entities, architectures, packages,
  // package bodies, modules and generics, in file-key order and each file's own order.
  virtual CitI::Result getAllDesignUnits(IHdlDesignUnitSet** out) = 0;
  // Slot 5. A new configuration that the project does not keep.
  virtual CitI::Result getNewParserConfig(IHdlParserConfig** out) = 0;
  // Slot 6. A new source file, not yet in the project's file set.
  virtual CitI::Result createNewFile(IHdlFile** out) = 0;
  // Slot 7. Not provided: clears `out`, kNotImpl.
  virtual CitI::Result Reserved7(CitI::IInterface** out) = 0;
  // Slot 8. The project's own configuration, which every file of the project reads.
  virtual CitI::Result getParserConfig(IHdlParserConfig** out) = 0;
};

}  // namespace Vad
