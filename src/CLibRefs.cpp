#include "CLibRefs.h"

#include "Identifiers.h"
#include "Port/InitObjects.h"

namespace Vad {

CitI::IInterface* CLibRefs::QueryInterface(const Port::XUID& id) {
  if (id == InterfaceIds::ImplementationIdentity()) return this;
  if (id == Prjrep::IRefCount::Iid()) return &refs_;
  // Counted and created like every other class, so it answers IInterface as well.
  if (id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result CLibRefs::LoadLibraries(CitI::IInterface* parserConfig) {
  return parserConfig ? CitI::kOk : CitI::kInvalidArg;
}

bool CLibRefs::HasLibraryUnit(const Port::StringBase&, const Port::StringBase&, const Port::StringBase&,
                              const Port::StringBase&, const Port::StringBase&) const {
  return false;
}

}  // namespace Vad
