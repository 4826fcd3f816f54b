// A component instantiation inside an architecture or a module.
#pragma once

#include <string_view>

#include "CHdlElement.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class CompInst : public CHdlElement {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  CompInst();
  // Type ComponentInstantiation; the label is also the object name; registered under `parent`.
  CompInst(std::string_view label, std::string_view componentName, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::CompInst(); }

  ~CompInst() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  const Port::StringBase& GetLabel() const { return label_; }
  // Sets the label and, with it, the object name.
  void SetLabel(std::string_view label);
  const Port::StringBase& GetComponentName() const { return componentName_; }
  // "|ComponentInstantiation||<E>|<A>|<label>|<component>|" where E and A are the entity and
  // architecture names of a parent architecture, or the module name twice for a parent module.
  // Without either parent they are the INVALID_PARENT_ texts of EntityInst. Also kept as the
  // store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<CompInst> persist_{this};
  Port::StringBase label_;
  Port::StringBase componentName_;
};

}  // namespace Vad
