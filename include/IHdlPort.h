// One port of a design unit, and the iterator over the ports that a port query hands out.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"
#include "Prjrep/ISet.h"

namespace Vad {

// The range bounds are those written in the source, evaluated from the defaults of the unit's
// generics or parameters; a port without a range (or whose range cannot be evaluated) reports 0
// for both, so its span, low and high are 0.
class IHdlPort : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlPort)
  // Slot 2. The port name; kInvalidArg for a null out-parameter.
  virtual CitI::Result getName(Port::StringBase* out) = 0;
  // Slot 3. The 1-based place of the port in the unit's port list.
  virtual std::uint32_t getPosition() = 0;
  // Slot 4. The type as written ("std_logic_vector", "wire", "reg"); kInvalidArg for a null
  // out-parameter.
  virtual CitI::Result getTypeName(Port::StringBase* out) = 0;
  // Slot 5. kDirectionIn, kDirectionOut, or kDirectionOther for every other mode (inout).
  virtual std::int32_t getDirection() = 0;
  // Slot 6. The distance between the two bounds, not plus one (7 downto 0 gives 7).
  virtual std::int32_t getRangeSpan() = 0;
  // Slot 7. True when the port is declared with a range that could be evaluated.
  virtual bool hasRange() = 0;
  // Slot 8. The smaller bound.
  virtual std::int32_t getRangeLow() = 0;
  // Slot 9. The larger bound.
  virtual std::int32_t getRangeHigh() = 0;

  static constexpr std::int32_t kDirectionIn = 0;
  static constexpr std::int32_t kDirectionOut = 1;
  static constexpr std::int32_t kDirectionOther = 13;
};

// Current answers null past the end; Next answers 1 there too and IsDone stays true.
class IHdlPortIterator : public Prjrep::IIteratorOf<IHdlPort> {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlPortIterator)
};

}  // namespace Vad
