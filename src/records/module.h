// A Verilog module (or a unit of another source kind that stands for one).
#pragma once

#include <string_view>

#include "CHdlElement.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class module : public CHdlElement {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  module();
  // Type Module; the module name is a copy of `name`.
  module(std::string_view name, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::module(); }

  ~module() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // "Module|<module name>".
  void GetDesignUnitKey(Port::StringBase& out) const override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  const Port::StringBase& GetModuleName() const { return moduleName_; }
  // "|Module||<module name>", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);

 private:
  TPersistHelper<module> persist_{this};
  Port::StringBase moduleName_;
};

}  // namespace Vad
