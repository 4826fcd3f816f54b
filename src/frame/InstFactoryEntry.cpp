// The module's entry: registers the class factories with the host's registry.
#include <vector>

#include "Arch.h"
#include "CElaborator.h"
#include "CHdlFile.h"
#include "CHdlProject.h"
#include "CLibRefs.h"
#include "CNetListNode.h"
#include "CParserConfigBase.h"
#include "CParserConfigHolder.h"
#include "CompInst.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "Identifiers.h"
#include "Library.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "PluginParserFactory.h"
#include "Port/InitObjects.h"
#include "Prjrep/AutoPtr.h"
#include "RavA/Factory.h"
#include "TFactory.h"
#include "Use.h"
#include "generic.h"
#include "module.h"

namespace Vad {
namespace {

struct ClassEntry {
  const Port::XUID& (*classId)();
  CitI::IFactory* (*makeFactory)();
};

template <class Class, const Port::XUID& (*ClassId)()>
CitI::IFactory* MakeFactory() {
  return new Port::TFactory<Class, ClassId>();
}

template <class Class, const Port::XUID& (*ClassId)()>
constexpr ClassEntry EntryOf() {
  return ClassEntry{ClassId, &MakeFactory<Class, ClassId>};
}

// In registration order: CHdlProject, CHdlFile, CParserConfigHolder and CParserConfigBase come
// before the records; CNetListNode and CElaborator before generic; CLibRefs last.
constexpr ClassEntry kClasses[] = {
    EntryOf<CHdlProject, &ClassIds::CHdlProject>(),
    EntryOf<CHdlFile, &ClassIds::CHdlFile>(),
    EntryOf<CParserConfigHolder, &ClassIds::CParserConfigHolder>(),
    EntryOf<CParserConfigBase, &ClassIds::CParserConfigBase>(),
    EntryOf<Arch, &ClassIds::Arch>(),
    EntryOf<CompInst, &ClassIds::CompInst>(),
    EntryOf<EntityDecl, &ClassIds::EntityDecl>(),
    EntryOf<EntityInst, &ClassIds::EntityInst>(),
    EntryOf<Library, &ClassIds::Library>(),
    EntryOf<PackageBody, &ClassIds::PackageBody>(),
    EntryOf<PackageDecl, &ClassIds::PackageDecl>(),
    EntryOf<Use, &ClassIds::Use>(),
    EntryOf<module, &ClassIds::module>(),
    EntryOf<CNetListNode, &ClassIds::CNetListNode>(),
    EntryOf<CElaborator, &ClassIds::CElaborator>(),
    EntryOf<generic, &ClassIds::generic>(),
    EntryOf<CLibRefs, &ClassIds::CLibRefs>(),
};

// Factories registered by this module, unregistered when the module is unloaded so that the
// registry never holds code that is gone.
std::vector<Port::XUID>& RegisteredHere() {
  static std::vector<Port::XUID> ids;
  return ids;
}

struct UnregisterAtUnload {
  UnregisterAtUnload() { RegisteredHere(); }
  ~UnregisterAtUnload() {
    for (const Port::XUID& id : RegisteredHere()) RavA::Factory::UnregisterFactory(id);
  }
} unregisterAtUnload;

void RegisterClass(const ClassEntry& entry) {
  // The registry takes its own reference; the entry's reference ends with this scope.
  Prjrep::AutoRelease<CitI::IInterface> factory(entry.makeFactory());
  auto* asFactory = Prjrep::QueryAs<CitI::IFactory>(factory.Get());
  if (!asFactory) return;
  if (RavA::Factory::RegisterFactory(entry.classId(), asFactory)) RegisteredHere().push_back(entry.classId());
}

// The parsers live above the project; every holder made from here on parses through them.
void InstallParsers() {
  static const PluginParserFactory parsers;
  CParserConfigHolder::InstallParserFactory(&parsers);
}

}  // namespace
}  // namespace Vad

extern "C" __attribute__((visibility("default"))) void InstFactoryEntry() {
  Vad::InstallParsers();
  for (const Vad::ClassEntry& entry : Vad::kClasses) Vad::RegisterClass(entry);
}
