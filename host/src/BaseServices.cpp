#include "Host/BaseServices.h"

#include "Host/DataStore.h"

namespace Host {

Prjrep::AutoPtr<Vad::IBaseServices> BaseServices::Create() {
  return Prjrep::AutoRelease<Vad::IBaseServices>(new BaseServices);
}

BaseServices::BaseServices() : dataStore_(DataStore::Shared()) {}

CitI::IInterface* BaseServices::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Vad::IBaseServices::Iid() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result BaseServices::GetService(const Port::XUID& service, CitI::IInterface** out) {
  Prjrep::AutoOut<CitI::IInterface> result(out);
  if (result.IsMissing()) return CitI::kInvalidArg;
  if (service != Vad::InterfaceIds::DataStoreService()) return CitI::kFail;
  result.Set(dataStore_.Get());
  return CitI::kOk;
}

}  // namespace Host
