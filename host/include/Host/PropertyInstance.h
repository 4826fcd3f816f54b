// The host's property instance (Vad::IPropertyInstance): one project property and its value.
#pragma once

#include <string_view>

#include "IPropertyInstance.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

class PropertyInstance final : public Vad::IPropertyInstance {
 public:
  // The factory makes one with no name and an empty value.
  static Prjrep::AutoPtr<Vad::IPropertyInstance> Create(std::string_view name = {},
                                                        std::string_view value = {});

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result SetValue(const Port::StringBase& value) override;
  CitI::Result GetName(Port::StringBase* out) override;
  CitI::Result GetValue(Port::StringBase* out) override;
  CitI::Result SetName(const Port::StringBase& name) override;

 private:
  PropertyInstance(std::string_view name, std::string_view value) : name_(name), value_(value) {}

  Prjrep::TRefCountHelper<> refCount_{this};
  Port::StringBase name_;
  Port::StringBase value_;
};

}  // namespace Host
