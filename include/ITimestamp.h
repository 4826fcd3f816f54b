// A point in time with microsecond resolution.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "IPersist.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Prjrep {

class ITimestamp : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::ITimestamp)
  virtual CitI::Result SetToNow() = 0;
  virtual CitI::Result SetTime(std::int64_t seconds, std::int64_t microseconds) = 0;
  virtual CitI::Result GetTime(std::int64_t* seconds, std::int64_t* microseconds) = 0;
  virtual CitI::Result GetText(Port::StringBase* text) = 0;
  virtual CitI::Result Compare(ITimestamp* other, std::int32_t* order) = 0;
  virtual CitI::Result IsNewerThan(ITimestamp* other, bool* newer) = 0;
  virtual CitI::Result IsOlderThan(ITimestamp* other, bool* older) = 0;
  virtual CitI::Result Load(IArchive* archive) = 0;
  virtual CitI::Result Save(IArchive* archive) = 0;
};

}  // namespace Prjrep
