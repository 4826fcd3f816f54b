#include "RavA/Factory.h"

#include <algorithm>
#include <utility>

#include "Prjrep/RefCounting.h"

namespace RavA {
namespace {

struct Entry {
  Port::XUID classId;
  CitI::IFactory* factory;
};

std::vector<Entry>& Registry() {
  static std::vector<Entry> entries;
  return entries;
}

std::vector<Entry>::iterator Find(const Port::XUID& classId) {
  auto& entries = Registry();
  return std::find_if(entries.begin(), entries.end(), [&](const Entry& e) { return e.classId == classId; });
}

// Releases the remaining factories when the host library is unloaded.
// The registry is constructed first so that it outlives this object.
struct RegistryCleanup {
  RegistryCleanup() { Registry(); }
  ~RegistryCleanup() { Factory::Clear(); }
} cleanup;

}  // namespace

bool Factory::RegisterFactory(const Port::XUID& classId, CitI::IFactory* factory) {
  if (!factory) return false;
  Prjrep::AddRefOf(factory);
  auto it = Find(classId);
  if (it != Registry().end()) {
    CitI::IFactory* old = std::exchange(it->factory, factory);
    Prjrep::ReleaseOf(old);
  } else {
    Registry().push_back({classId, factory});
  }
  return true;
}

bool Factory::UnregisterFactory(const Port::XUID& classId) {
  auto it = Find(classId);
  if (it == Registry().end()) return false;
  CitI::IFactory* factory = it->factory;
  Registry().erase(it);
  Prjrep::ReleaseOf(factory);
  return true;
}

CitI::IInterface* Factory::CreateInstance(const Port::XUID& classId) {
  auto it = Find(classId);
  if (it == Registry().end()) return nullptr;
  return it->factory->CreateInstance(classId);
}

bool Factory::IsRegistered(const Port::XUID& classId) { return Find(classId) != Registry().end(); }

std::vector<Port::XUID> Factory::RegisteredClasses() {
  std::vector<Port::XUID> ids;
  for (const Entry& e : Registry()) ids.push_back(e.classId);
  return ids;
}

void Factory::Clear() {
  std::vector<Entry> entries;
  entries.swap(Registry());
  for (Entry& e : entries) Prjrep::ReleaseOf(e.factory);
}

}  // namespace RavA
