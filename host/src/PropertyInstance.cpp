#include "Host/PropertyInstance.h"

#include "ComponentSupport.h"

namespace Host {

Prjrep::AutoPtr<Vad::IPropertyInstance> PropertyInstance::Create(std::string_view name,
                                                                 std::string_view value) {
  return Prjrep::AutoRelease<Vad::IPropertyInstance>(new PropertyInstance(name, value));
}

CitI::IInterface* PropertyInstance::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Vad::IPropertyInstance::Iid() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result PropertyInstance::SetValue(const Port::StringBase& value) {
  value_ = value;
  return CitI::kOk;
}

CitI::Result PropertyInstance::GetName(Port::StringBase* out) { return CopyOut(name_, out); }

CitI::Result PropertyInstance::GetValue(Port::StringBase* out) { return CopyOut(value_, out); }

CitI::Result PropertyInstance::SetName(const Port::StringBase& name) {
  if (name.IsEmpty()) return CitI::kInvalidArg;
  name_ = name;
  return CitI::kOk;
}

}  // namespace Host
