#include "Host/FileComponent.h"

#include "ComponentSupport.h"

namespace Host {

Prjrep::AutoPtr<Vad::IFile> FileComponent::Create(std::string_view path) {
  return Prjrep::AutoRelease<Vad::IFile>(new FileComponent(path));
}

CitI::IInterface* FileComponent::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Vad::IFile::Iid() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result FileComponent::GetPath(Port::StringBase* out) { return CopyOut(path_, out); }

CitI::Result FileComponent::SetPath(const Port::StringBase& path) {
  path_ = path;
  return CitI::kOk;
}

}  // namespace Host
