// Every class the module registers, created through the registry as a host creates it: the faces
// it answers, their identity and symmetry, and the faces it refuses.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "Prjrep/RefCounting.h"
#include "TestHost.h"

using test_host::Owned;
namespace Ids = Vad::InterfaceIds;

namespace {

// A class identifier, in registration order, and the identifiers its objects answer.
struct ClassFaces {
  const char* classId;
  const char* name;
  std::vector<Port::XUID> faces;
};

std::vector<Port::XUID> Join(std::vector<Port::XUID> faces, const std::vector<Port::XUID>& more) {
  faces.insert(faces.end(), more.begin(), more.end());
  return faces;
}

const Port::XUID kUnknown{std::string_view("{0F0F0F0F-1234-4567-89AB-0123456789AB}")};

std::vector<ClassFaces> Table() {
  const std::vector<Port::XUID> record{
      CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Ids::ImplementationIdentity(),
      Ids::IEventSender(),     Ids::IHdlDesignUnit(),    Ids::IHdlGraphicsPosition(),
      Ids::IHdlClientData(),   Ids::IHdlTextPosition(),  Ids::IName(),
      Ids::IHdlElement(),      Ids::IHdlDUProperties(),  Ids::IInstanceData(),
      Ids::ITimestamp(),       Ids::IDesignUnit(),       Ids::IPersist()};
  const std::vector<Port::XUID> vhdlUnit = Join(record, {Ids::IHdlUseClauses()});
  return {
      {"{10977847-7D8D-46e9-AC19-7B0EED3C4657}",
       "CHdlProject",
       {CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Ids::IHdlProject(), Ids::IHdlFileSet(),
        Ids::IHdlElaborationData()}},
      {"{E16DACC1-8C84-40e5-9BD1-6CB03EFBC730}",
       "CHdlFile",
       {CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Ids::IHdlFile(), Ids::IHdlFileV3(),
        Ids::IFileCompReference(), Ids::ICompAdmin(), Ids::IFileNameHelper(), Ids::ISourceLibraryMember(),
        Ids::IHdlParseResults()}},
      {"{FAA048F9-8C24-49c7-85D3-F06A29DD8991}",
       "CParserConfigHolder",
       {CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Vad::ClassIds::CParserConfigHolder()}},
      {"{4A0A6551-1ACD-4fc7-8920-FD1FEDBAB94F}",
       "CParserConfigBase",
       {CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Ids::IHdlParserConfig(),
        Ids::IPropertyInstanceSet(), Vad::ClassIds::CParserConfigBase()}},
      {"{B455570A-EED2-4698-A482-28044A3997D1}", "Arch", vhdlUnit},
      {"{E98AEF7C-E10B-484f-A7CD-963EDE1BF7D9}", "CompInst", record},
      {"{E2CC8569-A0F6-4aca-AFBE-31FF458253C6}", "EntityDecl", vhdlUnit},
      {"{AF9C1056-1ED5-46d1-BD53-C559888FA192}", "EntityInst", record},
      {"{7B140123-F848-4cb3-9125-64CC03A8200D}", "Library", record},
      {"{125F2E77-A70C-491f-B339-492C7A639441}", "PackageBody", vhdlUnit},
      {"{11A2A34D-836F-4a38-919B-B48596CFB15F}", "PackageDecl", vhdlUnit},
      {"{57990C42-7A4B-434b-A0D2-7F23B7AD3A05}", "Use", record},
      {"{BD090D6C-F645-4865-81F9-5449CC51FBC8}", "module", record},
      {"{9EF5D01C-AD83-45f9-BA57-9BCDCACF20A0}",
       "CNetListNode",
       {CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Prjrep::IRefCountV1::Iid(),
        Ids::ImplementationIdentity(), Ids::IHdlNetListNode(), Ids::IHdlNetListNodeInternal(),
        Ids::IHdlPartitionData(), Ids::IInstanceData(), UtilI::kTclCollectableId}},
      {"{8F9FBAB9-1703-4d81-B0DC-173EF14A6BF7}",
       "CElaborator",
       {CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Prjrep::IRefCountV1::Iid()}},
      {"{808B1C11-0D94-4e59-BFC8-767D8F5A6B13}", "generic", record},
      {"{C54A64FB-ED25-4d16-89FE-A274D9CB3E60}",
       "CLibRefs",
       {CitI::IInterface::Iid(), Prjrep::IRefCount::Iid(), Ids::ImplementationIdentity()}},
  };
}

// Every identifier some class answers, the class identifiers, and some that none answers.
std::vector<Port::XUID> Probes(const std::vector<ClassFaces>& table) {
  std::vector<Port::XUID> probes{CitI::IFactory::Iid(),
                                 CommonI::IRefCount::Iid(),
                                 Ids::IHdlPort(),
                                 Ids::IHdlDesignUnitSet(),
                                 Ids::ISourceLibrary(),
                                 kUnknown,
                                 Port::XUID(Ids::IHdlElement().High(), 0)};
  for (const ClassFaces& entry : table) {
    probes.push_back(Port::XUID(std::string_view(entry.classId)));
    probes.insert(probes.end(), entry.faces.begin(), entry.faces.end());
  }
  return probes;
}

bool Listed(const std::vector<Port::XUID>& ids, const Port::XUID& id) {
  return std::find(ids.begin(), ids.end(), id) != ids.end();
}

// Each interface has a face of its own, apart from the object itself and the identifiers that
// name another face again (the implementation identity, the older counting interface).
bool FacesAreDistinct(CitI::IInterface* object, const std::vector<Port::XUID>& ids) {
  std::vector<CitI::IInterface*> faces;
  for (const Port::XUID& id : ids) {
    if (id == Ids::ImplementationIdentity() || id == Prjrep::IRefCountV1::Iid()) continue;
    CitI::IInterface* face = object->QueryInterface(id);
    if (face != object) faces.push_back(face);
  }
  std::sort(faces.begin(), faces.end());
  return std::adjacent_find(faces.begin(), faces.end()) == faces.end();
}

class Conformance : public test_host::RegisteredModule {};

TEST_F(Conformance, TheModuleRegistersEveryClassOfTheTableInItsOrder) {
  const std::vector<ClassFaces> table = Table();
  std::vector<Port::XUID> expected;
  for (const ClassFaces& entry : table) expected.push_back(Port::XUID(std::string_view(entry.classId)));
  std::vector<Port::XUID> registered;
  for (const Port::XUID& id : RavA::Factory::RegisteredClasses())
    if (Listed(expected, id)) registered.push_back(id);
  EXPECT_EQ(registered, expected);
  EXPECT_EQ(expected.size(), 17u);
}

TEST_F(Conformance, EveryClassAnswersExactlyItsFacesSymmetricallyAndWithoutTakingReferences) {
  const std::vector<ClassFaces> table = Table();
  const std::vector<Port::XUID> probes = Probes(table);
  for (const ClassFaces& entry : table) {
    SCOPED_TRACE(entry.name);
    Owned<CitI::IInterface> object(
        RavA::Factory::CreateInstance(Port::XUID(std::string_view(entry.classId))));
    ASSERT_TRUE(object);
    ASSERT_EQ(Prjrep::RefCountOf(object.Get()), 1u);
    for (const Port::XUID& probe : probes) {
      CitI::IInterface* face = object->QueryInterface(probe);
      EXPECT_EQ(face != nullptr, Listed(entry.faces, probe)) << probe.ToString();
    }
    for (const Port::XUID& id : entry.faces) {
      CitI::IInterface* face = object->QueryInterface(id);
      if (!face) continue;
      EXPECT_EQ(face->QueryInterface(CitI::IInterface::Iid()), object.Get()) << id.ToString();
      for (const Port::XUID& other : entry.faces) {
        EXPECT_EQ(face->QueryInterface(other), object->QueryInterface(other))
            << id.ToString() << " -> " << other.ToString();
      }
      EXPECT_EQ(face->QueryInterface(kUnknown), nullptr) << id.ToString();
    }
    EXPECT_TRUE(FacesAreDistinct(object.Get(), entry.faces));
    if (Listed(entry.faces, Ids::ImplementationIdentity())) {
      // The implementation itself: the object, or for a net-list node its node face.
      const Port::XUID same =
          entry.name == std::string("CNetListNode") ? Ids::IHdlNetListNode() : CitI::IInterface::Iid();
      EXPECT_EQ(object->QueryInterface(Ids::ImplementationIdentity()), object->QueryInterface(same));
    }
    EXPECT_EQ(Prjrep::RefCountOf(object.Get()), 1u) << "queries take no reference";
  }
}

}  // namespace
