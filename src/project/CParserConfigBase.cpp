#include "CParserConfigBase.h"

#include "CHdlPropertyIterator.h"
#include "Identifiers.h"
#include "Port/InitObjects.h"
#include "Prjrep/Casts.h"

namespace Vad {

CitI::IInterface* CParserConfigBase::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refs_;
  if (id == IHdlParserConfig::Iid()) return &parserConfigFace_;
  if (id == IPropertyInstanceSet::Iid()) return &propertySetFace_;
  // The factory and every owning pointer ask for IInterface, so it is answered like the class.
  if (id == ClassIds::CParserConfigBase() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result CParserConfigBase::GetPropertyValue(const Port::StringBase& name,
                                                 Port::StringBase& value) const {
  value.Empty();
  auto it = properties_.find(name);
  if (it != properties_.end() && it->second) it->second->GetValue(&value);
  return CitI::kOk;
}

void CParserConfigBase::GetSignature(Port::StringBase& signature) const {
  signature.Empty();
  for (const auto& [name, instance] : properties_) {
    Port::StringBase value;
    if (instance) instance->GetValue(&value);
    signature.AppendFormat("****%s=%s****", name.c_str(), value.c_str());
  }
}

CitI::Result CParserConfigBase::AddProperty(IPropertyInstance* instance) {
  if (!instance) return CitI::kFail;
  Port::StringBase name;
  instance->GetName(&name);
  properties_[name] = instance;
  return CitI::kOk;
}

CitI::Result CParserConfigBase::RemoveProperty(IPropertyInstanceIterator* position) {
  auto* iterator = Prjrep::ImplementationCast<CHdlPropertyIterator>(position);
  if (!iterator || !iterator->Iterates(this) || iterator->IsDone()) return CitI::kFail;
  Port::StringBase name = iterator->CurrentName();
  iterator->Next();
  properties_.erase(name);
  return CitI::kOk;
}

CitI::Result CParserConfigBase::CreatePropertyIterator(IPropertyInstanceIterator** out) {
  if (!out) return CitI::kInvalidArg;
  *out = CHdlPropertyIterator::New(this).Detach();
  return *out ? CitI::kOk : CitI::kFail;
}

CitI::Result CParserConfigBase::ClearProperties() {
  PropertyTable released;
  released.swap(properties_);
  return CitI::kOk;
}

}  // namespace Vad
