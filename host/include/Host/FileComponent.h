// The host's file component (Vad::IFile) that a source file can be linked to.
#pragma once

#include "IFile.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

// Holds a path only; it answers no design-unit interface, so the module's look-up of
// referenced transform bindings through it finds nothing.
class FileComponent final : public Vad::IFile {
 public:
  static Prjrep::AutoPtr<Vad::IFile> Create(std::string_view path = {});

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result GetPath(Port::StringBase* out) override;
  CitI::Result SetPath(const Port::StringBase& path) override;

 private:
  explicit FileComponent(std::string_view path) : path_(path) {}

  Prjrep::TRefCountHelper<> refCount_{this};
  Port::StringBase path_;
};

}  // namespace Host
