// Persistence: the archive that the host hands to Load/Save and the facet of persistent objects.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Prjrep {

class IPersist;

// The host's project archive. Every operation returns 1 on success; any other value is a
// failure code that callers pass back unchanged.
class IArchive : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{3B6F0D52-8E41-4C7A-9A5E-2F7C1D84B930}")
  virtual CitI::Result GetVersion(std::int32_t* version) = 0;
  // An owned object: written whole; read back re-created through the factory registry by its
  // class identifier, with its instance identifier restored, carrying one reference.
  virtual CitI::Result ReadObject(CitI::IInterface** object) = 0;
  virtual CitI::Result WriteObject(IPersist* object) = 0;
  // A reference to an object written elsewhere in the same archive (before or after), or null.
  // The pointer read back carries no reference; the archive keeps the object alive while open.
  virtual CitI::Result ReadObjectRef(CitI::IInterface** object) = 0;
  virtual CitI::Result WriteObjectRef(IPersist* object) = 0;
  virtual CitI::Result ReadInt(std::int32_t* value) = 0;
  virtual CitI::Result WriteInt(std::int32_t value) = 0;
  virtual CitI::Result ReadInt64(std::int64_t* value) = 0;
  virtual CitI::Result WriteInt64(std::int64_t value) = 0;
  virtual CitI::Result ReadBool(bool* value) = 0;
  virtual CitI::Result WriteBool(bool value) = 0;
  virtual CitI::Result ReadString(Port::StringBase* value) = 0;
  virtual CitI::Result WriteString(const Port::StringBase& value) = 0;
  virtual CitI::Result ReadXUID(Port::XUID* value) = 0;
  virtual CitI::Result WriteXUID(const Port::XUID& value) = 0;
};

class IPersist : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IPersist)
  virtual CitI::Result Load(IArchive* archive) = 0;
  virtual CitI::Result Save(IArchive* archive) = 0;
  virtual CitI::Result GetClassXUID(Port::XUID* id) = 0;
  virtual CitI::Result GetInstanceXUID(Port::XUID* id) = 0;
  virtual CitI::Result SetInstanceXUID(const Port::XUID& id) = 0;
  virtual CitI::Result SetOwner(CitI::IInterface* owner) = 0;
  virtual CitI::Result GetOwner(CitI::IInterface** owner) = 0;
};

}  // namespace Prjrep
