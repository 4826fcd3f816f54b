#include "Host/DesignUnitType.h"

#include "ComponentSupport.h"

namespace Host {

Prjrep::AutoPtr<Vad::IDesignUnitType> DesignUnitType::Create(const Port::XUID& typeId,
                                                             std::string_view fileTypeName,
                                                             std::string_view name) {
  return Prjrep::AutoRelease<Vad::IDesignUnitType>(new DesignUnitType(typeId, fileTypeName, name));
}

CitI::IInterface* DesignUnitType::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Vad::IDesignUnitType::Iid() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result DesignUnitType::GetTypeId(Port::XUID* out) { return CopyOut(typeId_, out); }

CitI::Result DesignUnitType::GetName(Port::StringBase* out) { return CopyOut(name_, out); }

CitI::Result DesignUnitType::GetFileTypeName(Port::StringBase* out) { return CopyOut(fileTypeName_, out); }

}  // namespace Host
