// A generic of a design unit.
#pragma once

#include <string_view>

#include "CHdlElement.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class generic : public CHdlElement {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  generic();
  // Type Generic; the generic name is a copy of `name`.
  generic(std::string_view name, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::generic(); }

  ~generic() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // "Generic|<generic name>".
  void GetDesignUnitKey(Port::StringBase& out) const override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  const Port::StringBase& GetGenericName() const { return genericName_; }
  // "|Generic||<generic name>", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<generic> persist_{this};
  Port::StringBase genericName_;
};

}  // namespace Vad
