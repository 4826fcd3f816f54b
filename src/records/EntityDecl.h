// A VHDL entity declaration.
#pragma once

#include <string_view>

#include "CVhdlDU.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class EntityDecl : public CVhdlDU {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  EntityDecl();
  // Type Entity; the entity name is a copy of `name`.
  EntityDecl(std::string_view name, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::EntityDecl(); }

  ~EntityDecl() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // "Entity|<entity name>".
  void GetDesignUnitKey(Port::StringBase& out) const override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  const Port::StringBase& GetEntityName() const { return entityName_; }
  // "|Entity||<entity name>", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<EntityDecl> persist_{this};
  Port::StringBase entityName_;
};

}  // namespace Vad
