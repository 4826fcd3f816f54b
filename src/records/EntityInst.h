// A VHDL entity instantiation ("label: entity lib.name(arch)") inside an architecture.
#pragma once

#include <string_view>

#include "CHdlElement.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

// The store-key texts that stand for the names of a parent that is no architecture.
inline constexpr const char* kInvalidParentEntity = "INVALID_PARENT_ENTITY";
inline constexpr const char* kInvalidParentArchitecture = "INVALID_PARENT_ARCHITECT";

class EntityInst : public CHdlElement {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  EntityInst();
  // Type EntityInstantiation; registered under `parent`. The label, entity and architecture
  // fields are set afterwards.
  EntityInst(std::string_view label, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::EntityInst(); }

  ~EntityInst() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  // Sets the label and, with it, the object name.
  void SetLabel(std::string_view label);
  void SetEntityName(std::string_view entityName) { entityName_ = entityName; }
  // Empty when the instantiation names no architecture.
  void SetArchitectureName(std::string_view architectureName) { architectureName_ = architectureName; }
  const Port::StringBase& GetLabel() const { return label_; }
  const Port::StringBase& GetEntityName() const { return entityName_; }
  // Persisted and keyed, but set by nothing but a load.
  const Port::StringBase& GetReserved() const { return reserved_; }
  const Port::StringBase& GetArchitectureName() const { return architectureName_; }
  // "|EntityInstantiation||<E>|<A>|<label>|<entity>|<reserved>|<architecture>" where E and A are
  // the parent architecture's entity and architecture names, or the INVALID_PARENT_ texts when
  // the parent is no architecture. Also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<EntityInst> persist_{this};
  Port::StringBase label_;
  Port::StringBase entityName_;
  Port::StringBase reserved_;
  Port::StringBase architectureName_;
};

}  // namespace Vad
