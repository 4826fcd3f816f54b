// A write-only project archive that keeps what an object's Save writes as a list of values.
// quillon reads the fields of a design-unit record this way: the record layout of the archive is
// part of the module's interface, while the records answer no interface for their store key,
// names and parent.
#pragma once

#include <cstdint>
#include <string>
#include <variant>
#include <vector>

#include "IPersist.h"
#include "Port/StringBase.h"
#include "Port/XUID.h"

namespace quillon {

class RecordingArchive final : public Prjrep::IArchive {
 public:
  // An owned object is noted, not written: the values are those of the saving object alone.
  struct OwnedObject {
    Prjrep::IPersist* object;
  };
  struct ObjectReference {
    Prjrep::IPersist* object;
  };
  // Strings are kept as std::string so that a reader can move them out.
  using Value =
      std::variant<std::int32_t, std::int64_t, bool, std::string, Port::XUID, OwnedObject, ObjectReference>;

  // Archives of this version and later carry every field of a design-unit record.
  static constexpr std::int32_t kVersion = 9;

  const std::vector<Value>& values() const { return values_; }
  std::vector<Value>& values() { return values_; }
  // Forgets the values but keeps their room, so that one archive serves many records.
  void Clear() { values_.clear(); }

  // Lives on the caller's stack: it answers no reference-count interface.
  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result GetVersion(std::int32_t* version) override;
  CitI::Result WriteObject(Prjrep::IPersist* object) override;
  CitI::Result WriteObjectRef(Prjrep::IPersist* object) override;
  CitI::Result WriteInt(std::int32_t value) override;
  CitI::Result WriteInt64(std::int64_t value) override;
  CitI::Result WriteBool(bool value) override;
  CitI::Result WriteString(const Port::StringBase& value) override;
  CitI::Result WriteXUID(const Port::XUID& value) override;

  // Reading is not offered: kFail.
  CitI::Result ReadObject(CitI::IInterface** object) override;
  CitI::Result ReadObjectRef(CitI::IInterface** object) override;
  CitI::Result ReadInt(std::int32_t* value) override;
  CitI::Result ReadInt64(std::int64_t* value) override;
  CitI::Result ReadBool(bool* value) override;
  CitI::Result ReadString(Port::StringBase* value) override;
  CitI::Result ReadXUID(Port::XUID* value) override;

 private:
  CitI::Result Keep(Value value);

  std::vector<Value> values_;
};

}  // namespace quillon
