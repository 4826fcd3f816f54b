#include "Port/Init.h"

#include "Port/XUID.h"
#include "RavA/Factory.h"

namespace {

// Constant-initialised, so they count correctly whichever library's statics run first.
std::atomic<int> fileHolders{0};
std::atomic<int> pathListHolders{0};
std::atomic<int> instanceTableHolders{0};
std::atomic<int> factoryHolders{0};
std::atomic<int> msgManHolders{0};

// A query constructs the registry, which then outlives every static object built after it.
void ReadyFactoryRegistry() { RavA::Factory::IsRegistered(Port::XUID()); }

}  // namespace

namespace Port {

ServiceInit::ServiceInit(std::atomic<int>& holders, void (*readyService)()) : holders_(holders) {
  if (holders_.fetch_add(1, std::memory_order_acq_rel) == 0 && readyService) readyService();
}

ServiceInit::~ServiceInit() { holders_.fetch_sub(1, std::memory_order_acq_rel); }

FileInit::FileInit() : ServiceInit(fileHolders, nullptr) {}
int FileInit::Holders() { return fileHolders.load(); }

PathListInit::PathListInit() : ServiceInit(pathListHolders, nullptr) {}
int PathListInit::Holders() { return pathListHolders.load(); }

}  // namespace Port

namespace RavA {

InstanceTableInit::InstanceTableInit() : ServiceInit(instanceTableHolders, nullptr) {}
int InstanceTableInit::Holders() { return instanceTableHolders.load(); }

FactoryInit::FactoryInit() : ServiceInit(factoryHolders, &ReadyFactoryRegistry) {}
int FactoryInit::Holders() { return factoryHolders.load(); }

}  // namespace RavA

Port_MsgManInit::Port_MsgManInit() : ServiceInit(msgManHolders, nullptr) {}
int Port_MsgManInit::Holders() { return msgManHolders.load(); }
