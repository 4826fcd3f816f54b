// The design-unit records: keys, parent and child links, and what each writes to and reads from an
// archive, through an archive that logs every operation.
#include <gtest/gtest.h>

#include <deque>
#include <functional>
#include <string>
#include <vector>

#include "Arch.h"
#include "CompInst.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "IHdlUseClauses.h"
#include "IPersist.h"
#include "Library.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "Port/MsgManData.h"
#include "Port/SafeCount.h"
#include "Prjrep/RefCounting.h"
#include "TestHost.h"
#include "Use.h"
#include "generic.h"
#include "module.h"

using test_host::Owned;
using Vad::DbObject;

namespace {

// An archive that logs every operation and gives back on reading what was written, in order per
// kind of value. The operation with index `failAt` fails with kFailCode, and so does a read of a
// kind whose values are used up. Objects read are handed back as they were written (not loaded).
class ScriptArchive final : public Prjrep::IArchive {
 public:
  static constexpr CitI::Result kFailCode = 7;

  std::vector<std::string> log;
  int failAt = -1;

  void QueueObject(CitI::IInterface* object) { objects_.push_back(object); }
  // The logged operations whose text starts with `prefix`.
  std::vector<std::string> Logged(const std::string& prefix) const {
    std::vector<std::string> found;
    for (const std::string& entry : log)
      if (entry.rfind(prefix, 0) == 0) found.push_back(entry);
    return found;
  }

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == IArchive::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result GetVersion(std::int32_t* version) override {
    return Step("GetVersion") ? (*version = 9, CitI::kOk) : kFailCode;
  }
  CitI::Result WriteObject(Prjrep::IPersist* object) override {
    if (Put("WriteObject " + NameOf(object), objects_, object) != CitI::kOk) return kFailCode;
    return object ? object->Save(this) : CitI::kFail;
  }
  CitI::Result ReadObject(CitI::IInterface** object) override {
    Prjrep::AutoOut<CitI::IInterface> out(object);
    CitI::IInterface* next = nullptr;
    const CitI::Result result = Take("ReadObject", objects_, &next);
    out.Set(next);
    return result;
  }
  CitI::Result WriteObjectRef(Prjrep::IPersist* object) override {
    return Put("WriteObjectRef " + NameOf(object), refs_, object);
  }
  CitI::Result ReadObjectRef(CitI::IInterface** object) override {
    *object = nullptr;
    return Take("ReadObjectRef", refs_, object);
  }
  CitI::Result WriteInt(std::int32_t value) override {
    return Put("WriteInt " + std::to_string(value), ints_, value);
  }
  CitI::Result ReadInt(std::int32_t* value) override { return Take("ReadInt", ints_, value); }
  CitI::Result WriteInt64(std::int64_t value) override {
    return Put("WriteInt64 " + std::to_string(value), ints_, value);
  }
  CitI::Result ReadInt64(std::int64_t* value) override { return Take("ReadInt64", ints_, value); }
  CitI::Result WriteBool(bool value) override {
    return Put(value ? "WriteBool 1" : "WriteBool 0", ints_, value);
  }
  CitI::Result ReadBool(bool* value) override { return Take("ReadBool", ints_, value); }
  CitI::Result WriteString(const Port::StringBase& value) override {
    return Put("WriteString " + value.str(), strings_, value);
  }
  CitI::Result ReadString(Port::StringBase* value) override { return Take("ReadString", strings_, value); }
  CitI::Result WriteXUID(const Port::XUID& value) override {
    return Put("WriteXUID " + value.ToString(), xuids_, value);
  }
  CitI::Result ReadXUID(Port::XUID* value) override { return Take("ReadXUID", xuids_, value); }

 private:
  static std::string NameOf(Prjrep::IPersist* object) {
    auto* record = Prjrep::ImplementationCast<DbObject>(object);
    return object ? (record ? record->GetName().str() : "?") : "null";
  }
  bool Step(std::string entry) {
    log.push_back(std::move(entry));
    return static_cast<int>(log.size()) - 1 != failAt;
  }
  template <class T, class V>
  CitI::Result Put(std::string entry, std::deque<T>& values, const V& value) {
    if (!Step(std::move(entry))) return kFailCode;
    values.push_back(value);
    return CitI::kOk;
  }
  // Ints, 64-bit ints and booleans share one line, as each record reads them in writing order.
  template <class T, class V>
  CitI::Result Take(const char* operation, std::deque<T>& values, V* value) {
    if (!Step(operation) || values.empty()) return kFailCode;
    *value = static_cast<V>(values.front());
    values.pop_front();
    return CitI::kOk;
  }

  std::deque<CitI::IInterface*> objects_;
  std::deque<CitI::IInterface*> refs_;
  std::deque<std::int64_t> ints_;
  std::deque<Port::StringBase> strings_;
  std::deque<Port::XUID> xuids_;
};

std::vector<DbObject*> ChildrenOf(const DbObject& object) {
  std::vector<DbObject*> children;
  for (DbObject* child : object.GetChildren()) children.push_back(child);
  return children;
}

std::string DesignUnitKeyOf(const DbObject& record) {
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

// One record of a class: how it is made (instances inside architecture rtl of counter), its type,
// design-unit key and store key, and how its factory's empty object is made.
struct RecordCase {
  const char* classId;
  std::uint32_t type;
  std::function<Vad::CHdlElement*(Vad::Arch*, std::string*)> make;  // also answers the store key
  std::function<Vad::CHdlElement*()> makeEmpty;
  const char* designUnitKey;
  const char* storeKey;
};

template <class Record>
Record* Keyed(Record* record, std::string* storeKey) {
  *storeKey = StoreKeyOf(*record);
  return record;
}

// A record made from `args`; an instance is made inside the architecture, a unit outside it.
template <class Record, class... Args>
RecordCase Of(const char* classId, std::uint32_t type, const char* designUnitKey, const char* storeKey,
              Args... args) {
  const bool instance = type == Vad::DbType::kComponentInstantiation;
  return {classId,
          type,
          [=](Vad::Arch* parent, std::string* key) {
            return Keyed(new Record(args..., instance ? parent : nullptr), key);
          },
          [] { return new Record; },
          designUnitKey,
          storeKey};
}

const std::vector<RecordCase>& RecordCases() {
  using namespace Vad;
  static const std::vector<RecordCase> cases{
      Of<Library>("{7B140123-F848-4cb3-9125-64CC03A8200D}", DbType::kLibrary, "Library", "||Library|work|",
                  "work"),
      Of<EntityDecl>("{E2CC8569-A0F6-4aca-AFBE-31FF458253C6}", DbType::kEntity, "Entity|counter",
                     "|Entity||counter", "counter"),
      Of<Arch>("{B455570A-EED2-4698-A482-28044A3997D1}", DbType::kArchitecture, "Architecture|counter|rtl",
               "|Architecture||rtl|counter||", "counter", "rtl"),
      Of<PackageDecl>("{11A2A34D-836F-4a38-919B-B48596CFB15F}", DbType::kPackageDecl, "PackageDecl|types",
                      "|PackageDecl||types|", "types"),
      Of<PackageBody>("{125F2E77-A70C-491f-B339-492C7A639441}", DbType::kPackageBody, "PackageBody|types",
                      "|PackageBody||types|", "types"),
      Of<Use>("{57990C42-7A4B-434b-A0D2-7F23B7AD3A05}", DbType::kUse, "Use", "||Use|ieee|std_logic_1164|all|",
              "ieee.std_logic_1164.all"),
      Of<generic>("{808B1C11-0D94-4e59-BFC8-767D8F5A6B13}", DbType::kGeneric, "Generic|WIDTH",
                  "|Generic||WIDTH", "WIDTH"),
      Of<module>("{BD090D6C-F645-4865-81F9-5449CC51FBC8}", DbType::kModule, "Module|top", "|Module||top",
                 "top"),
      Of<CompInst>("{E98AEF7C-E10B-484f-A7CD-963EDE1BF7D9}", DbType::kComponentInstantiation,
                   "ComponentInstantiation", "|ComponentInstantiation||counter|rtl|u1|adder|", "u1", "adder"),
      {"{AF9C1056-1ED5-46d1-BD53-C559888FA192}", DbType::kEntityInstantiation,
       [](Arch* parent, std::string* key) {
         auto* instance = new EntityInst("u2", parent);
         instance->SetLabel("u2");
         instance->SetEntityName("adder");
         instance->SetArchitectureName("fast");
         return Keyed(instance, key);
       },
       [] { return new EntityInst; }, "EntityInstantiation",
       "|EntityInstantiation||counter|rtl|u2|adder||fast"},
  };
  return cases;
}

// ---- every record class --------------------------------------------------------------------------

TEST(Records, EveryClassNamesItsTypeDesignUnitKeyAndStoreKey) {
  Owned<Vad::Arch> parent(new Vad::Arch("counter", "rtl", nullptr));
  for (const RecordCase& recordCase : RecordCases()) {
    SCOPED_TRACE(recordCase.storeKey);
    std::string storeKey;
    Owned<Vad::CHdlElement> record(recordCase.make(parent.Get(), &storeKey));
    EXPECT_EQ(record->GetType(), recordCase.type);
    EXPECT_EQ(DesignUnitKeyOf(*record), recordCase.designUnitKey);
    EXPECT_EQ(storeKey, recordCase.storeKey);
  }
  Owned<Vad::EntityDecl> unloaded(new Vad::EntityDecl);
  EXPECT_EQ(DesignUnitKeyOf(*unloaded), "Unknown|");
}

class RecordFactories : public test_host::RegisteredModule {};

TEST_F(RecordFactories, CreateEveryRecordClassEmptyAndPersistingUnderItsClass) {
  for (const RecordCase& recordCase : RecordCases()) {
    const Port::XUID id{std::string_view(recordCase.classId)};
    Owned<CitI::IInterface> created(RavA::Factory::CreateInstance(id));
    auto* record = Prjrep::ImplementationCast<Vad::CHdlElement>(created.Get());
    ASSERT_NE(record, nullptr) << recordCase.classId;
    EXPECT_EQ(record->GetType(), 0u);
    EXPECT_EQ(record->GetName(), "");
    EXPECT_EQ(record->GetParent(), nullptr);
    Port::XUID classId;
    EXPECT_EQ(Prjrep::QueryAs<Prjrep::IPersist>(created.Get())->GetClassXUID(&classId), CitI::kOk);
    EXPECT_EQ(classId, id);
  }
}

// Every record but the use clause stops at the first failing archive operation, saving and
// loading, and returns its code unchanged.
TEST(Records, ArchiveFailuresStopEveryRecordAndComeBackUnchanged) {
  Owned<Vad::Arch> parent(new Vad::Arch("counter", "rtl", nullptr));
  Port_DebugCapture debug;
  for (const RecordCase& recordCase : RecordCases()) {
    if (recordCase.type == Vad::DbType::kUse) continue;
    SCOPED_TRACE(recordCase.storeKey);
    std::string storeKey;
    Owned<Vad::CHdlElement> record(recordCase.make(parent.Get(), &storeKey));
    ScriptArchive complete;
    ASSERT_EQ(record->Save(&complete), CitI::kOk);
    const std::size_t writes = complete.log.size();
    for (std::size_t failAt = 0; failAt < writes; ++failAt) {
      ScriptArchive archive;
      archive.failAt = static_cast<int>(failAt);
      EXPECT_EQ(record->Save(&archive), ScriptArchive::kFailCode) << failAt;
      EXPECT_EQ(archive.log.size(), failAt + 1);
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
      ASSERT_GT(archive.log.size(), failAt);
      const std::size_t parentReference = 3;  // after the timestamp and the type code
      if (failAt == parentReference) {
        EXPECT_EQ(archive.log[failAt], "ReadObjectRef");
        EXPECT_EQ(result, CitI::kOk) << "a bad parent reference is only reported";
      } else {
        EXPECT_EQ(result, ScriptArchive::kFailCode) << failAt;
        EXPECT_EQ(archive.log.size(), failAt + 1);
      }
    }
  }
}

// ---- keys and fields of particular records -------------------------------------------------------

TEST(Records, InstanceStoreKeysNameTheirParentOrAPlaceholder) {
  Owned<Vad::module> top(new Vad::module("top", nullptr));
  Owned<Vad::PackageDecl> configuration(new Vad::PackageDecl("top_cfg", nullptr));
  Owned<Vad::CompInst> inModule(new Vad::CompInst("u1", "adder", top.Get()));
  Owned<Vad::CompInst> parentless(new Vad::CompInst("u4", "adder", nullptr));
  EXPECT_EQ(StoreKeyOf(*inModule), "|ComponentInstantiation||top|top|u1|adder|");
  EXPECT_EQ(StoreKeyOf(*parentless),
            "|ComponentInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|u4|adder|");

  const auto entityInstance = [](DbObject* parent, const char* entity, const char* architecture) {
    Owned<Vad::EntityInst> instance(new Vad::EntityInst("u2", parent));
    instance->SetLabel("u2");
    instance->SetEntityName(entity);
    instance->SetArchitectureName(architecture);
    return StoreKeyOf(*instance);
  };
  EXPECT_EQ(entityInstance(nullptr, "adder", ""),
            "|EntityInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|u2|adder||");
  EXPECT_EQ(entityInstance(top.Get(), "", ""),
            "|EntityInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|u2|||");
  EXPECT_EQ(entityInstance(configuration.Get(), "top", "rtl"), "|EntityInstantiation||top_cfg||u2|top||rtl");

  inModule->SetLabel("u7");
  EXPECT_EQ(inModule->GetName(), "u7");
  EXPECT_EQ(inModule->GetLabel(), "u7");
  EXPECT_STREQ(configuration->GetKindText(), "packagedecl");
  EXPECT_EQ(configuration->GetExtensionObject(), nullptr);
}

TEST(Records, UseSplitsItsSelectedNameIntoAtMostThreeParts) {
  const std::pair<const char*, std::vector<std::string>> cases[] = {
      {"ieee.std_logic_1164.all", {"ieee", "std_logic_1164", "all"}},
      {"work.pkg", {"work", "pkg", ""}},
      {"mylib", {"mylib", "", ""}},
      {"a.b.c.d", {"a", "b", "c"}},
  };
  for (const auto& [name, parts] : cases) {
    Owned<Vad::Use> use(new Vad::Use(name, nullptr));
    EXPECT_EQ(PartsOf(*use), parts) << name;
    EXPECT_EQ(use->GetName(), name);
  }
  Owned<Vad::Use> use(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  use->SetParts("work", "types", "");
  EXPECT_EQ(PartsOf(*use), (std::vector<std::string>{"work", "types", ""}));
}

TEST(Records, VhdlUnitsTellTheStoreKeysOfTheirUsesThroughAnInterface) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Use> a(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Owned<Vad::Use> b(new Vad::Use("work.types", nullptr));
  StoreKeyOf(*a);
  StoreKeyOf(*b);
  entity->SetUses({a.Get(), b.Get()});

  auto* useClauses = Prjrep::QueryAs<Vad::IHdlUseClauses>(entity.Get());
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
}

TEST(Records, PersistenceFacetKeepsAFreshInstanceIdentifierAndItsOwner) {
  Owned<Vad::EntityDecl> first(new Vad::EntityDecl("a", nullptr));
  Owned<Vad::EntityDecl> second(new Vad::EntityDecl("b", nullptr));
  auto* persist = Prjrep::QueryAs<Prjrep::IPersist>(first.Get());
  Port::XUID id, otherId;
  EXPECT_EQ(persist->GetInstanceXUID(&id), CitI::kOk);
  EXPECT_EQ(Prjrep::QueryAs<Prjrep::IPersist>(second.Get())->GetInstanceXUID(&otherId), CitI::kOk);
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

// ---- parents and children ------------------------------------------------------------------------

TEST(Records, ChildrenAreHeldByTheirParentAndReleasedWithIt) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::CompInst> kept(new Vad::CompInst("u1", "adder", architecture.Get()));
  DbObject* onlyInParent = Owned<Vad::CompInst>(new Vad::CompInst("u2", "adder", architecture.Get())).Get();
  EXPECT_EQ(Prjrep::RefCountOf(kept.Get()), 2u);
  EXPECT_EQ(Prjrep::RefCountOf(architecture.Get()), 1u);
  EXPECT_EQ(kept->GetParent(), architecture.Get());
  EXPECT_EQ(ChildrenOf(*architecture), (std::vector<DbObject*>{kept.Get(), onlyInParent}));

  const long alive = Port::LiveObjectCount();
  architecture.Reset();
  EXPECT_EQ(Port::LiveObjectCount(), alive - 2);  // the architecture and u2
  EXPECT_EQ(Prjrep::RefCountOf(kept.Get()), 1u);
  EXPECT_EQ(kept->GetParent(), nullptr);
}

TEST(Records, SetParentDoesNotLeaveThePreviousParentsList) {
  Owned<Vad::Arch> first(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::Arch> second(new Vad::Arch("counter", "fast", nullptr));
  Owned<Vad::CompInst> instance(new Vad::CompInst("u1", "adder", first.Get()));
  instance->SetParent(second.Get());
  EXPECT_EQ(instance->GetParent(), second.Get());
  EXPECT_EQ(first->GetChildCount(), 1u);
  EXPECT_EQ(second->GetChildCount(), 1u);
  EXPECT_EQ(Prjrep::RefCountOf(instance.Get()), 3u);
  first->AddChild(nullptr);
  EXPECT_EQ(first->GetChildCount(), 1u);
}

// ---- archives ------------------------------------------------------------------------------------

TEST(Records, SavingWithoutAParentWritesANullReferenceAndComplainsUnlessItIsAProject) {
  Owned<DbObject> project(new DbObject("project", nullptr));
  project->SetType(Vad::DbType::kProject);
  {
    Port_DebugCapture debug;
    ScriptArchive archive;
    EXPECT_EQ(project->PersistObject(&archive, true), CitI::kOk);
    EXPECT_EQ(archive.log, (std::vector<std::string>{"WriteInt 1024", "WriteObjectRef null", "WriteInt 0",
                                                     "WriteString project", "WriteString ", "WriteBool 0"}));
    EXPECT_EQ(debug.text(), "");
  }
  project->SetType(Vad::DbType::kUse);  // a bare object's keys are its type name
  Port::StringBase key = "stale text";
  project->GetDesignUnitKey(key);
  EXPECT_EQ(key, "Use");
  Port::StringBase prefix;
  project->AppendKeyPrefix(prefix);
  EXPECT_EQ(prefix, "|Use|");
  EXPECT_STREQ(DbObject::TypeNameOf(3), "Unknown");

  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Port_DebugCapture debug;
  ScriptArchive archive;
  EXPECT_EQ(entity->PersistObject(&archive, true), CitI::kOk);
  EXPECT_EQ(archive.Logged("WriteObjectRef"), std::vector<std::string>{"WriteObjectRef null"});
  EXPECT_EQ(debug.text(), "Error -- m_pParent can't be null\n");
  EXPECT_EQ(entity->PersistObject(nullptr, true), CitI::kInvalidArg);
}

TEST(Records, SavingRepairsAChildsBackPointerAndStopsAtANestedFailure) {
  Owned<Vad::Arch> saving(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::Arch> other(new Vad::Arch("counter", "fast", nullptr));
  Owned<Vad::CompInst> instance(new Vad::CompInst("u1", "adder", saving.Get()));
  other->AddChild(instance.Get());
  ASSERT_EQ(instance->GetParent(), other.Get());

  Port_DebugCapture debug;
  ScriptArchive complete;
  EXPECT_EQ(saving->PersistObject(&complete, true), CitI::kOk);
  EXPECT_EQ(instance->GetParent(), saving.Get());
  // The nested record names its repaired parent.
  EXPECT_EQ(complete.Logged("WriteObject"),
            (std::vector<std::string>{"WriteObjectRef null", "WriteObject u1", "WriteObjectRef rtl",
                                      "WriteObjectRef null"}));
  for (int failAt = 0; failAt < static_cast<int>(complete.log.size()); ++failAt) {
    ScriptArchive archive;
    archive.failAt = failAt;
    EXPECT_EQ(saving->PersistObject(&archive, true), ScriptArchive::kFailCode) << failAt;
    EXPECT_EQ(archive.log.size(), static_cast<std::size_t>(failAt) + 1) << failAt;
  }
}

TEST(Records, LoadingKeepsTheParentThatALoadedChildAlreadyHas) {
  Owned<Vad::Arch> loading(new Vad::Arch);
  Owned<Vad::Arch> elsewhere(new Vad::Arch("counter", "fast", nullptr));
  Owned<Vad::CompInst> orphan(new Vad::CompInst("u2", "adder", nullptr));
  Owned<Vad::CompInst> adopted(new Vad::CompInst("u1", "adder", elsewhere.Get()));
  ScriptArchive archive;
  archive.WriteInt(Vad::DbType::kArchitecture);
  archive.WriteObjectRef(nullptr);
  archive.WriteInt(2);
  archive.QueueObject(adopted.Get());
  archive.QueueObject(orphan.Get());
  archive.WriteString("rtl");
  archive.WriteString("|Architecture||rtl|counter||");
  archive.WriteBool(false);

  EXPECT_EQ(loading->PersistObject(&archive, false), CitI::kOk);
  EXPECT_EQ(loading->GetType(), Vad::DbType::kArchitecture);
  EXPECT_EQ(loading->GetName(), "rtl");
  EXPECT_EQ(loading->GetKey(), "|Architecture||rtl|counter||");
  EXPECT_EQ(ChildrenOf(*loading), (std::vector<DbObject*>{adopted.Get(), orphan.Get()}));
  EXPECT_EQ(adopted->GetParent(), elsewhere.Get());
  EXPECT_EQ(orphan->GetParent(), loading.Get());
  EXPECT_EQ(Prjrep::RefCountOf(orphan.Get()), 2u) << "the list holds the reference each read handed over";
}

TEST(Records, AnUnreadableParentIsReportedAfterLoadingTheRest) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl);
  ScriptArchive archive;
  archive.WriteInt(Vad::DbType::kEntity);
  archive.WriteInt(0);
  archive.WriteString("counter");
  archive.WriteString("|Entity||counter");
  archive.WriteBool(false);
  archive.log.clear();
  archive.failAt = 1;  // the parent reference

  Port_DebugCapture debug;
  EXPECT_EQ(entity->PersistObject(&archive, false), CitI::kOk);
  EXPECT_EQ(entity->GetName(), "counter");
  EXPECT_EQ(entity->GetParent(), nullptr);
  EXPECT_EQ(debug.text(), "DBObject m_pParent bad for counter |Entity||counter\n");
}

TEST(Records, VhdlUnitsKeepTheirUsesOutOfTheArchiveAndReadPastListedOnes) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::Use> a(new Vad::Use("ieee.std_logic_1164.all", nullptr));
  Owned<Vad::Use> b(new Vad::Use("work.types", nullptr));
  architecture->SetUses({a.Get(), b.Get()});
  std::vector<DbObject*> uses{architecture.Get()};
  architecture->GetUses(uses);
  EXPECT_EQ(uses, (std::vector<DbObject*>{a.Get(), b.Get()}));
  EXPECT_EQ(Prjrep::RefCountOf(a.Get()), 1u) << "the use list holds no references";

  Port_DebugCapture debug;
  ScriptArchive archive;
  ASSERT_EQ(architecture->Save(&archive), CitI::kOk);
  // After the element part: a use count of 0, then the architecture's own strings.
  EXPECT_EQ(std::vector<std::string>(archive.log.end() - 5, archive.log.end()),
            (std::vector<std::string>{"WriteInt 0", "WriteString ", "WriteString rtl", "WriteString ",
                                      "WriteString counter"}));
  EXPECT_EQ(archive.Logged("WriteObjectRef").size(), 2u) << "parent and client data only";
  Owned<Vad::Arch> loaded(new Vad::Arch);
  loaded->SetUses({a.Get()});
  EXPECT_EQ(loaded->Load(&archive), CitI::kOk);
  loaded->GetUses(uses);
  EXPECT_EQ(uses, std::vector<DbObject*>{a.Get()}) << "loading reads no uses into the list";
  EXPECT_EQ(loaded->GetArchitectureName(), "rtl");

  // An archive that lists uses: they are read past.
  Owned<Vad::EntityDecl> written(new Vad::EntityDecl("counter", nullptr));
  ScriptArchive listing;
  ASSERT_EQ(written->CHdlElement::Save(&listing), CitI::kOk);
  listing.WriteInt(2);
  listing.WriteObjectRef(Prjrep::QueryAs<Prjrep::IPersist>(b.Get()));
  listing.WriteObjectRef(nullptr);
  listing.WriteString("counter");
  Owned<Vad::EntityDecl> read(new Vad::EntityDecl);
  EXPECT_EQ(read->Load(&listing), CitI::kOk);
  EXPECT_EQ(read->GetEntityName(), "counter");
  read->GetUses(uses);
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
  shortArchive.WriteString("work");
  Owned<Vad::Use> loaded(new Vad::Use);
  EXPECT_EQ(loaded->Load(&shortArchive), CitI::kOk);
  EXPECT_EQ(PartsOf(*loaded), (std::vector<std::string>{"work", "", ""}));
}

}  // namespace
