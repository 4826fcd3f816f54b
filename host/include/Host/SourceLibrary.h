// The host's source library (Vad::ISourceLibrary, and Prjrep::IName with the same name).
#pragma once

#include <string_view>

#include "IName.h"
#include "ISourceLibrary.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

class SourceLibrary final : public Vad::ISourceLibrary {
 public:
  // The factory makes a library named "work", the library of files that name none.
  static Prjrep::AutoPtr<Vad::ISourceLibrary> Create(std::string_view name = "work");

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result GetName(Port::StringBase* out) override;
  // kInvalidArg for an empty name.
  CitI::Result SetName(const Port::StringBase& name) override;

 private:
  class XIName final : public Prjrep::TFace<Prjrep::IName, SourceLibrary> {
   public:
    using TFace::TFace;
    CitI::Result SetName(const Port::StringBase& name) override { return owner()->SetName(name); }
    CitI::Result GetName(Port::StringBase* out) override { return owner()->GetName(out); }
  };

  explicit SourceLibrary(std::string_view name) : name_(name) {}

  Prjrep::TRefCountHelper<> refCount_{this};
  XIName nameFace_{this};
  Port::StringBase name_;
};

}  // namespace Host
