// The library references: whether a name is a component of the maker's cell libraries.
//
// The cell libraries are not loaded yet: every look-up answers false, so no instance is taken
// for a library cell.
#pragma once

#include "CitI.h"
#include "Port/StringBase.h"
#include "Prjrep/TRefCountHelper.h"

namespace Vad {

class CLibRefs final : public CitI::IInterface {
 public:
  CLibRefs() = default;

  // Answers the implementation identity, IInterface and IRefCount.
  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // Follows the configuration's device family. kInvalidArg for a null configuration, else 1.
  CitI::Result LoadLibraries(CitI::IInterface* parserConfig);
  // Whether `package` of `library` declares the component `name`.
  bool HasLibraryUnit(const Port::StringBase& library, const Port::StringBase& package,
                      const Port::StringBase& item, const Port::StringBase& name,
                      const Port::StringBase& language) const;

 private:
  ~CLibRefs() override = default;
  friend class Prjrep::TRefCountHelper<CLibRefs>;

  Prjrep::TRefCountHelper<CLibRefs> refs_{this};
};

}  // namespace Vad
