// The host's process-wide data store: named text values shared by every component.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

// Keys are compared byte for byte; an empty key gives kInvalidArg, as does a null out-parameter.
class IDataStore : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IDataStore)
  // Inserts or replaces.
  virtual CitI::Result SetValue(const Port::StringBase& key, const Port::StringBase& value) = 0;
  // kFail (out emptied) for a missing key.
  virtual CitI::Result GetValue(const Port::StringBase& key, Port::StringBase* out) = 0;
  // kFail for a missing key.
  virtual CitI::Result RemoveValue(const Port::StringBase& key) = 0;
  virtual CitI::Result GetValueCount(std::uint32_t* count) = 0;
};

}  // namespace Vad
