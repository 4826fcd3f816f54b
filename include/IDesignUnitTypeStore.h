// The host's design-unit type store: one type object per (type identifier, file type).
#pragma once

#include <cstdint>

#include "CitI.h"
#include "IDesignUnitType.h"
#include "IFileType.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

// Null out-parameters give kInvalidArg.
class IDesignUnitTypeStore : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IDesignUnitTypeStore)
  // Slot 2. Names a type identifier, for the type objects made before and after. kInvalidArg for
  // an empty name.
  virtual CitI::Result SetTypeName(const Port::XUID& typeId, const Port::StringBase& name) = 0;
  // Slot 3. kFail (out emptied) when the identifier has no name.
  virtual CitI::Result GetTypeName(const Port::XUID& typeId, Port::StringBase* out) = 0;
  // Slot 4. The type object for `typeId` in the file type named by `fileType`, made on first
  // request and the same object afterwards, with one reference for the caller. kInvalidArg (out
  // null) for a null file type; kFail when the file type does not tell its name.
  virtual CitI::Result GetDesignUnitType(const Port::XUID& typeId, IFileType* fileType,
                                         IDesignUnitType** out) = 0;
  // Slot 5. The number of type objects made so far.
  virtual CitI::Result GetTypeCount(std::uint32_t* count) = 0;
};

}  // namespace Vad
