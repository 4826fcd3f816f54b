#include "Host/HostComponents.h"

#include <cstdint>

#include "Host/BaseServices.h"
#include "Host/DataStore.h"
#include "Host/EventReceiver.h"
#include "Host/FileComponent.h"
#include "Host/FileNameHelper.h"
#include "Host/FileType.h"
#include "Host/PropertyInstance.h"
#include "Host/SourceLibrary.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"
#include "RavA/Factory.h"

namespace Host {
namespace {

// Makes an object with one reference for the caller.
using Creator = CitI::IInterface* (*)();

class ComponentFactory final : public RavA::TFactory {
 public:
  ComponentFactory(const Port::XUID& classId, Creator create) : classId_(classId), create_(create) {}

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == CommonI::IRefCount::Iid()) return &refCount_;
    return RavA::TFactory::QueryInterface(id);
  }
  CitI::IInterface* CreateInstance(const Port::XUID& classId) override {
    return classId == classId_ ? create_() : nullptr;
  }

 private:
  Port::XUID classId_;
  Creator create_;
  std::int32_t count_ = 1;
  ComponentFactory* owner_ = this;
  CommonI::TRefCountHelper<ComponentFactory> refCount_{&count_, &owner_};
};

struct HostClass {
  const Port::XUID& (*classId)();
  Creator create;
};

const HostClass kHostClasses[] = {
    {Vad::ClassIds::HostFileNameHelper,
     []() -> CitI::IInterface* { return FileNameHelper::Create().Detach(); }},
    {Vad::ClassIds::HostBaseServices, []() -> CitI::IInterface* { return BaseServices::Create().Detach(); }},
    {ClassIds::FileType, []() -> CitI::IInterface* { return FileType::Create().Detach(); }},
    {ClassIds::FileComponent, []() -> CitI::IInterface* { return FileComponent::Create().Detach(); }},
    {ClassIds::SourceLibrary, []() -> CitI::IInterface* { return SourceLibrary::Create().Detach(); }},
    {ClassIds::DataStore, []() -> CitI::IInterface* { return DataStore::Shared().Detach(); }},
    {ClassIds::EventReceiver, []() -> CitI::IInterface* { return EventReceiver::Create().Detach(); }},
    {ClassIds::PropertyInstance, []() -> CitI::IInterface* { return PropertyInstance::Create().Detach(); }},
};

bool RegisterFactory(const HostClass& hostClass) {
  if (RavA::Factory::IsRegistered(hostClass.classId())) return true;
  Prjrep::AutoRelease<CitI::IFactory> factory(new ComponentFactory(hostClass.classId(), hostClass.create));
  return RavA::Factory::RegisterFactory(hostClass.classId(), factory.Get());
}

}  // namespace

bool RegisterHostComponents() {
  bool allRegistered = true;
  for (const HostClass& hostClass : kHostClasses) allRegistered = RegisterFactory(hostClass) && allRegistered;
  return allRegistered;
}

void UnregisterHostComponents() {
  for (const HostClass& hostClass : kHostClasses) RavA::Factory::UnregisterFactory(hostClass.classId());
}

}  // namespace Host
