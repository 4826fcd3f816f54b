// One design-unit type object of the host's type store (Vad::IDesignUnitType).
#pragma once

#include <string_view>

#include "IDesignUnitType.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

// Made only by the data store, which renames it when its type identifier is given a name.
class DesignUnitType final : public Vad::IDesignUnitType {
 public:
  static Prjrep::AutoPtr<Vad::IDesignUnitType> Create(const Port::XUID& typeId, std::string_view fileTypeName,
                                                      std::string_view name);

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result GetTypeId(Port::XUID* out) override;
  CitI::Result GetName(Port::StringBase* out) override;
  CitI::Result GetFileTypeName(Port::StringBase* out) override;

  void Rename(std::string_view name) { name_ = name; }

 private:
  DesignUnitType(const Port::XUID& typeId, std::string_view fileTypeName, std::string_view name)
      : typeId_(typeId), fileTypeName_(fileTypeName), name_(name) {}

  Prjrep::TRefCountHelper<> refCount_{this};
  Port::XUID typeId_;
  Port::StringBase fileTypeName_;
  Port::StringBase name_;
};

}  // namespace Host
