// A VHDL architecture body: its own name (also the object name) and the name of its entity.
#pragma once

#include <string_view>

#include "CVhdlDU.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class Arch : public CVhdlDU {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  Arch();
  // Type Architecture; the object name is the architecture name.
  Arch(std::string_view entityName, std::string_view architectureName, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::Arch(); }

  ~Arch() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // "Architecture|<entity name>|<architecture name>".
  void GetDesignUnitKey(Port::StringBase& out) const override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  const Port::StringBase& GetEntityName() const { return entityName_; }
  const Port::StringBase& GetArchitectureName() const { return architectureName_; }
  // Persisted and keyed, but set by nothing but a load.
  const Port::StringBase& GetReservedA() const { return reservedA_; }
  const Port::StringBase& GetReservedB() const { return reservedB_; }
  // "|Architecture||<architecture name>|<entity name>|<reserved B>|", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<Arch> persist_{this};
  Port::StringBase reservedA_;
  Port::StringBase architectureName_;
  Port::StringBase reservedB_;
  Port::StringBase entityName_;
};

}  // namespace Vad
