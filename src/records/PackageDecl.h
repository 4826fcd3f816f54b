// A VHDL package declaration.
#pragma once

#include <string_view>

#include "CVhdlDU.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class PackageDecl : public CVhdlDU {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  PackageDecl();
  // Type PackageDecl; the package name is a copy of `name`.
  PackageDecl(std::string_view name, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::PackageDecl(); }

  ~PackageDecl() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // "PackageDecl|<package name>".
  void GetDesignUnitKey(Port::StringBase& out) const override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;
  // The kind of this unit as text: "packagedecl".
  virtual const char* GetKindText() const { return "packagedecl"; }

  const Port::StringBase& GetPackageName() const { return packageName_; }
  // "|PackageDecl||<package name>|", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<PackageDecl> persist_{this};
  Port::StringBase packageName_;
};

}  // namespace Vad
