// The host's base services (Vad::IBaseServices): the way to the process-wide data store.
#pragma once

#include "IBaseServices.h"
#include "IDataStore.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

// Holds the process-wide data store while it lives.
class BaseServices final : public Vad::IBaseServices {
 public:
  static Prjrep::AutoPtr<Vad::IBaseServices> Create();

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // Vad::InterfaceIds::DataStoreService gives the data store; any other service kFail.
  CitI::Result GetService(const Port::XUID& service, CitI::IInterface** out) override;

 private:
  BaseServices();

  Prjrep::TRefCountHelper<> refCount_{this};
  Prjrep::AutoPtr<Vad::IDataStore> dataStore_;
};

}  // namespace Host
