// The persistence facet (Prjrep::IPersist) that every design-unit record embeds.
#pragma once

#include "IPersist.h"
#include "Port/XUID.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"

namespace Vad {

class DbObject;

// Forwards Load and Save to its owning record, reports the record class's identifier
// (`Record::ClassId()`, the one its factory is registered under, so that a loading archive can
// re-create the record) and keeps the record's instance identifier, a fresh one from
// construction on.
template <class Record>
class TPersistHelper final : public Prjrep::IPersist {
 public:
  explicit TPersistHelper(Record* owner) : owner_(owner), instanceId_(Port::XUID::New()) {}
  TPersistHelper(const TPersistHelper&) = delete;
  TPersistHelper& operator=(const TPersistHelper&) = delete;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return owner_ ? owner_->QueryInterface(id) : nullptr;
  }
  // kFail without an owner.
  CitI::Result Load(Prjrep::IArchive* archive) override {
    return owner_ ? owner_->Load(archive) : CitI::kFail;
  }
  CitI::Result Save(Prjrep::IArchive* archive) override {
    return owner_ ? owner_->Save(archive) : CitI::kFail;
  }
  CitI::Result GetClassXUID(Port::XUID* id) override {
    if (!id) return CitI::kInvalidArg;
    *id = Record::ClassId();
    return CitI::kOk;
  }
  CitI::Result GetInstanceXUID(Port::XUID* id) override {
    if (!id) return CitI::kInvalidArg;
    *id = instanceId_;
    return CitI::kOk;
  }
  CitI::Result SetInstanceXUID(const Port::XUID& id) override {
    instanceId_ = id;
    return CitI::kOk;
  }
  // An object that is no record of this class is stored as null; 1 when an owner was stored.
  CitI::Result SetOwner(CitI::IInterface* owner) override {
    owner_ = dynamic_cast<Record*>(Prjrep::ImplementationCast<DbObject>(owner));
    return owner_ ? CitI::kOk : CitI::kFail;
  }
  // The owner with one reference for the caller; 0 for a null out-parameter or without an owner.
  CitI::Result GetOwner(CitI::IInterface** owner) override {
    Prjrep::AutoOut<CitI::IInterface> out(owner);
    if (out.IsMissing()) return CitI::kFail;
    out.Set(owner_);
    return owner_ ? CitI::kOk : CitI::kFail;
  }

 private:
  Record* owner_;  // the record this facet is a member of
  Port::XUID instanceId_;
};

}  // namespace Vad
