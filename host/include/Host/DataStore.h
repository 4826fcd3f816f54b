// The host's process-wide data store (Vad::IDataStore), which is also its design-unit type
// store (Vad::IDesignUnitTypeStore).
#pragma once

#include <map>
#include <utility>

#include "IDataStore.h"
#include "IDesignUnitTypeStore.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

// There is at most one data store in the process. It lives while anyone holds it, so that no
// object outlives its users; a host that wants values and type objects kept for its whole run
// holds one reference (or one base-services object) from start to end.
class DataStore final : public Vad::IDataStore {
 public:
  // The process-wide store, made when none is alive. The base services and the factory hand out
  // this one.
  static Prjrep::AutoPtr<Vad::IDataStore> Shared();

  ~DataStore() override;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result SetValue(const Port::StringBase& key, const Port::StringBase& value) override;
  CitI::Result GetValue(const Port::StringBase& key, Port::StringBase* out) override;
  CitI::Result RemoveValue(const Port::StringBase& key) override;
  CitI::Result GetValueCount(std::uint32_t* count) override;

  // The operations of Vad::IDesignUnitTypeStore, answered through its face.
  CitI::Result SetTypeName(const Port::XUID& typeId, const Port::StringBase& name);
  CitI::Result GetTypeName(const Port::XUID& typeId, Port::StringBase* out);
  CitI::Result GetDesignUnitType(const Port::XUID& typeId, Vad::IFileType* fileType,
                                 Vad::IDesignUnitType** out);
  CitI::Result GetTypeCount(std::uint32_t* count);

 private:
  class XIDesignUnitTypeStore final : public Prjrep::TFace<Vad::IDesignUnitTypeStore, DataStore> {
   public:
    using TFace::TFace;
    CitI::Result SetTypeName(const Port::XUID& typeId, const Port::StringBase& name) override {
      return owner()->SetTypeName(typeId, name);
    }
    CitI::Result GetTypeName(const Port::XUID& typeId, Port::StringBase* out) override {
      return owner()->GetTypeName(typeId, out);
    }
    CitI::Result GetDesignUnitType(const Port::XUID& typeId, Vad::IFileType* fileType,
                                   Vad::IDesignUnitType** out) override {
      return owner()->GetDesignUnitType(typeId, fileType, out);
    }
    CitI::Result GetTypeCount(std::uint32_t* count) override { return owner()->GetTypeCount(count); }
  };

  using TypeKey = std::pair<Port::XUID, Port::StringBase>;  // type identifier, file-type name

  DataStore() = default;
  Port::StringBase NameOfType(const Port::XUID& typeId) const;

  Prjrep::TRefCountHelper<> refCount_{this};
  XIDesignUnitTypeStore typeStoreFace_{this};
  std::map<Port::StringBase, Port::StringBase> values_;
  std::map<Port::XUID, Port::StringBase> typeNames_;
  std::map<TypeKey, Prjrep::AutoPtr<Vad::IDesignUnitType>> types_;
};

}  // namespace Host
