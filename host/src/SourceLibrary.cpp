#include "Host/SourceLibrary.h"

#include "ComponentSupport.h"

namespace Host {

Prjrep::AutoPtr<Vad::ISourceLibrary> SourceLibrary::Create(std::string_view name) {
  return Prjrep::AutoRelease<Vad::ISourceLibrary>(new SourceLibrary(name));
}

CitI::IInterface* SourceLibrary::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Vad::ISourceLibrary::Iid()) return this;
  if (id == Prjrep::IName::Iid()) return &nameFace_;
  if (id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result SourceLibrary::GetName(Port::StringBase* out) { return CopyOut(name_, out); }

CitI::Result SourceLibrary::SetName(const Port::StringBase& name) {
  if (name.IsEmpty()) return CitI::kInvalidArg;
  name_ = name;
  return CitI::kOk;
}

}  // namespace Host
