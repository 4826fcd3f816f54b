#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <vector>

#include "Arch.h"
#include "CompInst.h"
#include "DatabaseFixtures.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "IHdlUseClauses.h"
#include "Library.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "Port/MsgManData.h"
#include "Prjrep/RefCounting.h"
#include "Use.h"
#include "generic.h"
#include "module.h"

using namespace database_test;

namespace {

std::string DesignUnitKeyOf(const Vad::DbObject& record) {
  Port::StringBase key;
  record.GetDesignUnitKey(key);
  return key.str();
}

template <class Record>
std::string StoreKeyOf(Record& record) {
  Port::StringBase key;
  record.ComposeStoreKey(key);
  EXPECT_EQ(record.GetKey(), key) << "the composed key is the record's store key";
  return key.str();
}

std::vector<std::string> PartsOf(const Vad::Use& use) {
  return {use.GetLibraryPart().str(), use.GetPackagePart().str(), use.GetItemPart().str()};
}

}  // namespace

TEST(Records, UseSplitsItsSelectedNameIntoAtMostThreeParts) {
  Owned<Vad::Use> full(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Owned<Vad::Use> packageOnly(new Vad::Use("work.pkg", nullptr));
  Owned<Vad::Use> libraryOnly(new Vad::Use("mylib", nullptr));
  Owned<Vad::Use> tooLong(new Vad::Use("a.b.c.d", nullptr));
  EXPECT_EQ(PartsOf(*full), (std::vector<std::string>{"ieee", "std_logic_1164", "all"}));
  EXPECT_EQ(PartsOf(*packageOnly), (std::vector<std::string>{"work", "pkg", ""}));
  EXPECT_EQ(PartsOf(*libraryOnly), (std::vector<std::string>{"mylib", "", ""}));
  EXPECT_EQ(PartsOf(*tooLong), (std::vector<std::string>{"a", "b", "c"}));
  EXPECT_EQ(full->GetName(), "ieee.std_logic_1164.all");

  full->SetParts("work", "types", "");
  EXPECT_EQ(PartsOf(*full), (std::vector<std::string>{"work", "types", ""}));
}

TEST(Records, FullConstructorsSetTypeNamesAndFields) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  EXPECT_EQ(architecture->GetType(), Vad::DbType::kArchitecture);
  EXPECT_EQ(architecture->GetName(), "rtl");
  EXPECT_EQ(architecture->GetArchitectureName(), "rtl");
  EXPECT_EQ(architecture->GetEntityName(), "counter");
  EXPECT_EQ(architecture->GetReservedA(), "");
  EXPECT_EQ(architecture->GetReservedB(), "");

  Owned<Vad::CompInst> component(new Vad::CompInst("u1", "adder", architecture.Get()));
  EXPECT_EQ(component->GetType(), Vad::DbType::kComponentInstantiation);
  EXPECT_EQ(component->GetName(), "u1");
  EXPECT_EQ(component->GetLabel(), "u1");
  EXPECT_EQ(component->GetComponentName(), "adder");
  component->SetLabel("u7");
  EXPECT_EQ(component->GetLabel(), "u7");
  EXPECT_EQ(component->GetName(), "u7");

  Owned<Vad::EntityInst> instance(new Vad::EntityInst("u2", architecture.Get()));
  EXPECT_EQ(instance->GetType(), Vad::DbType::kEntityInstantiation);
  EXPECT_EQ(instance->GetName(), "u2");
  instance->SetLabel("u2");
  instance->SetEntityName("adder");
  instance->SetArchitectureName("fast");
  EXPECT_EQ(instance->GetLabel(), "u2");
  EXPECT_EQ(instance->GetEntityName(), "adder");
  EXPECT_EQ(instance->GetReserved(), "");
  EXPECT_EQ(instance->GetArchitectureName(), "fast");

  Owned<Vad::Library> library(new Vad::Library("work", nullptr));
  Owned<Vad::PackageBody> body(new Vad::PackageBody("types", nullptr));
  Owned<Vad::generic> width(new Vad::generic("WIDTH", nullptr));
  Owned<Vad::module> top(new Vad::module("top", nullptr));
  EXPECT_EQ(library->GetType(), Vad::DbType::kLibrary);
  EXPECT_EQ(library->GetLibraryText(), "work");
  EXPECT_EQ(body->GetType(), Vad::DbType::kPackageBody);
  EXPECT_EQ(body->GetPackageName(), "types");
  EXPECT_EQ(width->GetType(), Vad::DbType::kGeneric);
  EXPECT_EQ(width->GetGenericName(), "WIDTH");
  EXPECT_EQ(top->GetType(), Vad::DbType::kModule);
  EXPECT_EQ(top->GetModuleName(), "top");
}

TEST(Records, DesignUnitKeysNameTheUnit) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::PackageDecl> package(new Vad::PackageDecl("types", nullptr));
  Owned<Vad::PackageBody> body(new Vad::PackageBody("types", nullptr));
  Owned<Vad::generic> width(new Vad::generic("WIDTH", nullptr));
  Owned<Vad::module> top(new Vad::module("top", nullptr));
  Owned<Vad::Library> library(new Vad::Library("work", nullptr));
  Owned<Vad::Use> use(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Owned<Vad::CompInst> component(new Vad::CompInst("u1", "adder", architecture.Get()));
  Owned<Vad::EntityInst> instance(new Vad::EntityInst("u2", architecture.Get()));

  EXPECT_EQ(DesignUnitKeyOf(*entity), "Entity|counter");
  EXPECT_EQ(DesignUnitKeyOf(*architecture), "Architecture|counter|rtl");
  EXPECT_EQ(DesignUnitKeyOf(*package), "PackageDecl|types");
  EXPECT_EQ(DesignUnitKeyOf(*body), "PackageBody|types");
  EXPECT_EQ(DesignUnitKeyOf(*width), "Generic|WIDTH");
  EXPECT_EQ(DesignUnitKeyOf(*top), "Module|top");
  EXPECT_EQ(DesignUnitKeyOf(*library), "Library");
  EXPECT_EQ(DesignUnitKeyOf(*use), "Use");
  EXPECT_EQ(DesignUnitKeyOf(*component), "ComponentInstantiation");
  EXPECT_EQ(DesignUnitKeyOf(*instance), "EntityInstantiation");

  Owned<Vad::EntityDecl> unloaded(new Vad::EntityDecl);
  EXPECT_EQ(DesignUnitKeyOf(*unloaded), "Unknown|");
}

TEST(Records, StoreKeysOfUnits) {
  Owned<Vad::Library> library(new Vad::Library("work", nullptr));
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::PackageDecl> package(new Vad::PackageDecl("types", nullptr));
  Owned<Vad::PackageBody> body(new Vad::PackageBody("types", nullptr));
  Owned<Vad::Use> use(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Owned<Vad::generic> width(new Vad::generic("WIDTH", nullptr));
  Owned<Vad::module> top(new Vad::module("top", nullptr));

  EXPECT_EQ(StoreKeyOf(*library), "||Library|work|");
  EXPECT_EQ(StoreKeyOf(*entity), "|Entity||counter");
  EXPECT_EQ(StoreKeyOf(*architecture), "|Architecture||rtl|counter||");
  EXPECT_EQ(StoreKeyOf(*package), "|PackageDecl||types|");
  EXPECT_EQ(StoreKeyOf(*body), "|PackageBody||types|");
  EXPECT_EQ(StoreKeyOf(*use), "||Use|ieee|std_logic_1164|all|");
  EXPECT_EQ(StoreKeyOf(*width), "|Generic||WIDTH");
  EXPECT_EQ(StoreKeyOf(*top), "|Module||top");
}

TEST(Records, InstanceStoreKeysNameTheirParent) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::module> top(new Vad::module("top", nullptr));
  Owned<Vad::CompInst> inArchitecture(new Vad::CompInst("u1", "adder", architecture.Get()));
  Owned<Vad::CompInst> inModule(new Vad::CompInst("u1", "adder", top.Get()));
  EXPECT_EQ(StoreKeyOf(*inArchitecture), "|ComponentInstantiation||counter|rtl|u1|adder|");
  EXPECT_EQ(StoreKeyOf(*inModule), "|ComponentInstantiation||top|top|u1|adder|");

  Owned<Vad::EntityInst> bound(new Vad::EntityInst("u2", architecture.Get()));
  bound->SetLabel("u2");
  bound->SetEntityName("adder");
  bound->SetArchitectureName("fast");
  EXPECT_EQ(StoreKeyOf(*bound), "|EntityInstantiation||counter|rtl|u2|adder||fast");

  Owned<Vad::EntityInst> orphan(new Vad::EntityInst("u2", nullptr));
  orphan->SetLabel("u2");
  orphan->SetEntityName("adder");
  EXPECT_EQ(StoreKeyOf(*orphan),
            "|EntityInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|u2|adder||");
  Owned<Vad::EntityInst> inModule2(new Vad::EntityInst("u3", top.Get()));
  inModule2->SetLabel("u3");
  EXPECT_EQ(StoreKeyOf(*inModule2),
            "|EntityInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|u3|||");

  // A component instance without its enclosing unit still gets a key instead of reading nothing.
  Owned<Vad::CompInst> parentless(new Vad::CompInst("u4", "adder", nullptr));
  EXPECT_EQ(StoreKeyOf(*parentless),
            "|ComponentInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|u4|adder|");
}

TEST(Records, PackageDeclarationsTellTheirKind) {
  Owned<Vad::PackageDecl> package(new Vad::PackageDecl("types", nullptr));
  EXPECT_STREQ(package->GetKindText(), "packagedecl");
  EXPECT_EQ(package->GetExtensionObject(), nullptr);
}

TEST(Records, VhdlUnitsKeepTheirUsesOutOfTheArchive) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::Use> a(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Owned<Vad::Use> b(new Vad::Use("work.types", nullptr));
  Owned<Vad::Use> c(new Vad::Use("work.more.all", nullptr));
  architecture->SetUses({a.Get(), b.Get(), c.Get()});
  std::vector<Vad::DbObject*> uses{architecture.Get()};
  architecture->GetUses(uses);
  EXPECT_EQ(uses, (std::vector<Vad::DbObject*>{a.Get(), b.Get(), c.Get()}));
  EXPECT_EQ(Prjrep::RefCountOf(a.Get()), 1u) << "the use list holds no references";

  Port_DebugCapture debug;
  ScriptArchive archive;
  ASSERT_EQ(architecture->Save(&archive), CitI::kOk);
  // After the element part: a use count of 0, then the architecture's own strings.
  auto tail = std::vector<std::string>(archive.log.end() - 5, archive.log.end());
  EXPECT_EQ(tail, (std::vector<std::string>{"WriteInt 0", "WriteString ", "WriteString rtl", "WriteString ",
                                            "WriteString counter"}));
  EXPECT_EQ(archive.Logged("WriteObjectRef").size(), 2u) << "parent and client data only";

  Owned<Vad::Arch> loaded(new Vad::Arch);
  loaded->SetUses({a.Get()});
  EXPECT_EQ(loaded->Load(&archive), CitI::kOk);
  loaded->GetUses(uses);
  EXPECT_EQ(uses, std::vector<Vad::DbObject*>{a.Get()}) << "loading reads no uses into the list";
  EXPECT_EQ(loaded->GetArchitectureName(), "rtl");
}

TEST(Records, VhdlUnitsTellTheStoreKeysOfTheirUsesThroughAnInterface) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Use> a(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Owned<Vad::Use> b(new Vad::Use("work.types", nullptr));
  Port::StringBase key;
  a->ComposeStoreKey(key);
  b->ComposeStoreKey(key);
  entity->SetUses({a.Get(), b.Get()});

  auto* useClauses = Prjrep::QueryAs<Vad::IHdlUseClauses>(entity.Get());
  ASSERT_NE(useClauses, nullptr);
  std::uint32_t count = 0;
  ASSERT_EQ(useClauses->GetUseCount(&count), CitI::kOk);
  EXPECT_EQ(count, 2u);
  Port::StringBase first, second;
  EXPECT_EQ(useClauses->GetUseStoreKey(0, &first), CitI::kOk);
  EXPECT_EQ(useClauses->GetUseStoreKey(1, &second), CitI::kOk);
  EXPECT_EQ(first, "||Use|ieee|std_logic_1164|all|");
  EXPECT_EQ(second, "||Use|work|types||");
  EXPECT_EQ(useClauses->GetUseStoreKey(2, &first), CitI::kInvalidArg);
  EXPECT_EQ(useClauses->GetUseStoreKey(0, nullptr), CitI::kInvalidArg);
  EXPECT_EQ(useClauses->GetUseCount(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlUseClauses>(a.Get()), nullptr) << "only VHDL units have use clauses";
}

TEST(Records, InstancesOfAConfigurationNameItInTheirStoreKeys) {
  Owned<Vad::PackageDecl> configuration(new Vad::PackageDecl("top_cfg", nullptr));
  Owned<Vad::EntityInst> block(new Vad::EntityInst("top", configuration.Get()));
  block->SetLabel("top");
  block->SetEntityName("top");
  block->SetArchitectureName("rtl");
  EXPECT_EQ(StoreKeyOf(*block), "|EntityInstantiation||top_cfg||top|top||rtl");
}

TEST(Records, VhdlUnitsReadPastUsesThatAnArchiveLists) {
  Owned<Vad::EntityDecl> written(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Use> use(new Vad::Use("work.types", nullptr));
  Port_DebugCapture debug;
  ScriptArchive archive;
  ASSERT_EQ(written->CHdlElement::Save(&archive), CitI::kOk);
  ASSERT_EQ(archive.WriteInt(2), CitI::kOk);
  ASSERT_EQ(archive.WriteObjectRef(Prjrep::QueryAs<Prjrep::IPersist>(use.Get())), CitI::kOk);
  ASSERT_EQ(archive.WriteObjectRef(nullptr), CitI::kOk);
  ASSERT_EQ(archive.WriteString("counter"), CitI::kOk);

  Owned<Vad::EntityDecl> loaded(new Vad::EntityDecl);
  EXPECT_EQ(loaded->Load(&archive), CitI::kOk);
  EXPECT_EQ(loaded->GetEntityName(), "counter");
  std::vector<Vad::DbObject*> uses;
  loaded->GetUses(uses);
  EXPECT_TRUE(uses.empty());
}

TEST(Records, GenericWritesItsNameTwiceBeforeItsGenericName) {
  Owned<Vad::generic> width(new Vad::generic("WIDTH", nullptr));
  Port_DebugCapture debug;
  ScriptArchive archive;
  ASSERT_EQ(width->Save(&archive), CitI::kOk);
  EXPECT_EQ(archive.Logged("WriteString"),
            (std::vector<std::string>{"WriteString WIDTH", "WriteString ", "WriteString WIDTH",
                                      "WriteString WIDTH"}));
  Owned<Vad::generic> loaded(new Vad::generic);
  EXPECT_EQ(loaded->Load(&archive), CitI::kOk);
  EXPECT_EQ(loaded->GetName(), "WIDTH");
  EXPECT_EQ(loaded->GetGenericName(), "WIDTH");
}

TEST(Records, UseIgnoresFailuresOfItsOwnStrings) {
  Owned<Vad::Use> use(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Port_DebugCapture debug;
  ScriptArchive complete;
  ASSERT_EQ(use->Save(&complete), CitI::kOk);
  const int size = static_cast<int>(complete.log.size());
  for (int failAt = size - 3; failAt < size; ++failAt) {
    ScriptArchive archive;
    archive.failAt = failAt;
    EXPECT_EQ(use->Save(&archive), CitI::kOk) << failAt;
    EXPECT_EQ(archive.log.size(), complete.log.size()) << "every part is still transferred";
  }
  ScriptArchive archive;
  archive.failAt = size - 4;  // the last operation of the base part
  EXPECT_EQ(use->Save(&archive), ScriptArchive::kFailCode);

  // Reading: the parts run out, yet the load succeeds.
  ScriptArchive shortArchive;
  ASSERT_EQ(use->CHdlElement::Save(&shortArchive), CitI::kOk);
  ASSERT_EQ(shortArchive.WriteString("work"), CitI::kOk);
  Owned<Vad::Use> loaded(new Vad::Use);
  EXPECT_EQ(loaded->Load(&shortArchive), CitI::kOk);
  EXPECT_EQ(PartsOf(*loaded), (std::vector<std::string>{"work", "", ""}));
}

// Every record stops at the first failing archive operation, saving and loading, and returns its
// code unchanged.
TEST(Records, ArchiveFailuresStopEveryRecordAndComeBackUnchanged) {
  struct Case {
    std::function<Vad::CHdlElement*()> make;
    std::function<Vad::CHdlElement*()> makeEmpty;
  };
  const std::vector<Case> cases{
      {[] { return new Vad::Library("work", nullptr); }, [] { return new Vad::Library; }},
      {[] { return new Vad::EntityDecl("counter", nullptr); }, [] { return new Vad::EntityDecl; }},
      {[] { return new Vad::Arch("counter", "rtl", nullptr); }, [] { return new Vad::Arch; }},
      {[] { return new Vad::PackageDecl("types", nullptr); }, [] { return new Vad::PackageDecl; }},
      {[] { return new Vad::PackageBody("types", nullptr); }, [] { return new Vad::PackageBody; }},
      {[] { return new Vad::CompInst("u1", "adder", nullptr); }, [] { return new Vad::CompInst; }},
      {[] { return new Vad::EntityInst("u2", nullptr); }, [] { return new Vad::EntityInst; }},
      {[] { return new Vad::generic("WIDTH", nullptr); }, [] { return new Vad::generic; }},
      {[] { return new Vad::module("top", nullptr); }, [] { return new Vad::module; }},
  };
  Port_DebugCapture debug;
  for (const Case& recordCase : cases) {
    Owned<Vad::CHdlElement> record(recordCase.make());
    ScriptArchive complete;
    ASSERT_EQ(record->Save(&complete), CitI::kOk);
    const std::size_t writes = complete.log.size();
    for (std::size_t failAt = 0; failAt < writes; ++failAt) {
      ScriptArchive archive;
      archive.failAt = static_cast<int>(failAt);
      EXPECT_EQ(record->Save(&archive), ScriptArchive::kFailCode) << record->GetName().str() << " " << failAt;
      EXPECT_EQ(archive.log.size(), failAt + 1) << record->GetName().str();
    }
    // Loading reads as many values as saving wrote; a failure at any of them but the parent
    // reference stops the load.
    for (std::size_t failAt = 0; failAt < writes; ++failAt) {
      ScriptArchive archive;
      ASSERT_EQ(record->Save(&archive), CitI::kOk);
      archive.log.clear();
      archive.failAt = static_cast<int>(failAt);
      Owned<Vad::CHdlElement> loaded(recordCase.makeEmpty());
      const CitI::Result result = loaded->Load(&archive);
      ASSERT_GT(archive.log.size(), failAt) << record->GetName().str();
      const std::size_t parentReference = 3;  // after the timestamp and the type code
      if (failAt == parentReference) {
        EXPECT_EQ(archive.log[failAt], "ReadObjectRef");
        EXPECT_EQ(result, CitI::kOk) << "a bad parent reference is only reported";
      } else {
        EXPECT_EQ(result, ScriptArchive::kFailCode) << record->GetName().str() << " " << failAt;
        EXPECT_EQ(archive.log.size(), failAt + 1) << record->GetName().str();
      }
    }
  }
}

TEST_F(RegisteredModule, FactoriesCreateEveryRecordClassEmptyWithOneReference) {
  const std::vector<Port::XUID> records{Vad::ClassIds::Arch(),        Vad::ClassIds::CompInst(),
                                        Vad::ClassIds::EntityDecl(),  Vad::ClassIds::EntityInst(),
                                        Vad::ClassIds::Library(),     Vad::ClassIds::PackageBody(),
                                        Vad::ClassIds::PackageDecl(), Vad::ClassIds::Use(),
                                        Vad::ClassIds::module(),      Vad::ClassIds::generic()};
  std::vector<Port::XUID> registered;
  for (const Port::XUID& id : RavA::Factory::RegisteredClasses())
    if (std::find(records.begin(), records.end(), id) != records.end()) registered.push_back(id);
  EXPECT_EQ(registered, records) << "registered in registration order";

  for (const Port::XUID& id : records) {
    Owned<CitI::IInterface> created(RavA::Factory::CreateInstance(id));
    ASSERT_TRUE(created) << id.ToString();
    EXPECT_EQ(Prjrep::RefCountOf(created.Get()), 1u);
    auto* record = Prjrep::ImplementationCast<Vad::CHdlElement>(created.Get());
    ASSERT_NE(record, nullptr);
    EXPECT_EQ(record->GetType(), 0u);
    EXPECT_EQ(record->GetName(), "");
    EXPECT_EQ(record->GetParent(), nullptr);
    auto* persist = Prjrep::QueryAs<Prjrep::IPersist>(created.Get());
    ASSERT_NE(persist, nullptr);
    Port::XUID classId;
    EXPECT_EQ(persist->GetClassXUID(&classId), CitI::kOk);
    EXPECT_EQ(classId, id);
  }
}

TEST(Records, PersistenceFacetKeepsAFreshInstanceIdentifierAndItsOwner) {
  Owned<Vad::EntityDecl> first(new Vad::EntityDecl("a", nullptr));
  Owned<Vad::EntityDecl> second(new Vad::EntityDecl("b", nullptr));
  auto* persist = Prjrep::QueryAs<Prjrep::IPersist>(first.Get());
  auto* otherPersist = Prjrep::QueryAs<Prjrep::IPersist>(second.Get());
  ASSERT_NE(persist, nullptr);
  EXPECT_EQ(persist->QueryInterface(CitI::IInterface::Iid()), first.Get());

  Port::XUID id;
  Port::XUID otherId;
  EXPECT_EQ(persist->GetInstanceXUID(&id), CitI::kOk);
  EXPECT_EQ(otherPersist->GetInstanceXUID(&otherId), CitI::kOk);
  EXPECT_FALSE(id.IsNull());
  EXPECT_NE(id, otherId);
  EXPECT_EQ(persist->SetInstanceXUID(otherId), CitI::kOk);
  persist->GetInstanceXUID(&id);
  EXPECT_EQ(id, otherId);

  Owned<CitI::IInterface> owner;
  EXPECT_EQ(persist->GetOwner(nullptr), CitI::kFail);
  EXPECT_EQ(persist->GetOwner(owner.Out()), CitI::kOk);
  EXPECT_EQ(owner.Get(), first.Get());
  EXPECT_EQ(Prjrep::RefCountOf(first.Get()), 2u);
  EXPECT_EQ(persist->SetOwner(nullptr), CitI::kFail);
  EXPECT_EQ(persist->Save(nullptr), CitI::kFail);
  EXPECT_EQ(persist->SetOwner(first.Get()), CitI::kOk);
  EXPECT_EQ(persist->Save(nullptr), CitI::kInvalidArg);
}
