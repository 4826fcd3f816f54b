// An object that a Tcl-style view lists by path name and type.
#pragma once

#include "CitI.h"
#include "Port/StringBase.h"

namespace UtilI {

// Null out-parameters give kInvalidArg.
class ITclCollectable : public CitI::IInterface {
 public:
  static constexpr Port::XUID Iid() { return kTclCollectableId; }
  // Slots 2 to 4.
  virtual CitI::Result GetName(Port::StringBase* out) = 0;
  virtual CitI::Result GetType(Port::StringBase* out) = 0;
  virtual CitI::Result GetCollectionId(Port::StringBase* out) = 0;
  // Slots 5 and 6. Always false.
  virtual bool Reserved5() = 0;
  virtual bool Reserved6() = 0;
  // Slots 7 to 9. Not provided: kNotImpl.
  virtual CitI::Result Reserved7() = 0;
  virtual CitI::Result Reserved8() = 0;
  virtual CitI::Result Reserved9() = 0;
  // Slot 10. Writes the path and type to standard output.
  virtual CitI::Result Print() = 0;
};

}  // namespace UtilI
