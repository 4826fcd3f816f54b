// The host's component registry: class identifier -> factory.
#pragma once

#include <vector>

#include "CitI.h"

namespace RavA {

class Factory {
 public:
  // Registers `factory` under `classId`, taking one reference through CommonI::IRefCount (or
  // Prjrep::IRefCount). A factory already registered under the same identifier is replaced and
  // released. False for a null factory.
  static bool RegisterFactory(const Port::XUID& classId, CitI::IFactory* factory);
  // Releases the factory registered under `classId`; false when there is none.
  static bool UnregisterFactory(const Port::XUID& classId);
  // A new object of the class, carrying one reference, or null when no factory is registered or
  // the factory refuses.
  static CitI::IInterface* CreateInstance(const Port::XUID& classId);
  static bool IsRegistered(const Port::XUID& classId);
  // The registered class identifiers in registration order.
  static std::vector<Port::XUID> RegisteredClasses();
  // Releases every factory (the registry is emptied at unload as well).
  static void Clear();
};

// The host's base for class factories: answers IInterface and IFactory with itself.
class TFactory : public CitI::IFactory {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == CitI::IInterface::Iid() || id == CitI::IFactory::Iid()) return this;
    return nullptr;
  }
};

}  // namespace RavA
