// A VHDL package body.
#pragma once

#include <string_view>

#include "CVhdlDU.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class PackageBody : public CVhdlDU {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  PackageBody();
  // Type PackageBody; the package name is a copy of `name`.
  PackageBody(std::string_view name, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::PackageBody(); }

  ~PackageBody() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // "PackageBody|<package name>".
  void GetDesignUnitKey(Port::StringBase& out) const override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  const Port::StringBase& GetPackageName() const { return packageName_; }
  // "|PackageBody||<package name>|", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<PackageBody> persist_{this};
  Port::StringBase packageName_;
};

}  // namespace Vad
