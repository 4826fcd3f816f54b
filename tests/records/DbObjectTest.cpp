#include <gtest/gtest.h>

#include <vector>

#include "Arch.h"
#include "CompInst.h"
#include "DatabaseFixtures.h"
#include "DbObject.h"
#include "EntityDecl.h"
#include "Port/MsgManData.h"
#include "Prjrep/RefCounting.h"
#include "Use.h"

using namespace database_test;
using Vad::DbObject;

namespace {

std::vector<DbObject*> ChildrenOf(const DbObject& object) {
  std::vector<DbObject*> children;
  for (DbObject* child : object.GetChildren()) children.push_back(child);
  return children;
}

}  // namespace

TEST(DbObject, TypeNamesCoverEverySingleBitAndNothingElse) {
  const char* names[] = {"File",
                         "Entity",
                         "Architecture",
                         "ComponentInstantiation",
                         "EntityInstantiation",
                         "Library",
                         "PackageDecl",
                         "PackageBody",
                         "Use",
                         "Include",
                         "Project",
                         "IncludedFile",
                         "ParserConfigHolder",
                         "Module",
                         "Generic"};
  for (std::uint32_t bit = 0; bit < 15; ++bit) EXPECT_STREQ(DbObject::TypeNameOf(1u << bit), names[bit]);
  EXPECT_STREQ(DbObject::TypeNameOf(0), "Unknown");
  EXPECT_STREQ(DbObject::TypeNameOf(3), "Unknown");
  EXPECT_STREQ(DbObject::TypeNameOf(32768), "Unknown");
  EXPECT_STREQ(DbObject::TypeNameOf(0x80000000u), "Unknown");
}

TEST(DbObject, BareObjectKeysAreItsTypeName) {
  Owned<DbObject> use(new DbObject("ieee.std_logic_1164.all", nullptr));
  use->SetType(Vad::DbType::kUse);
  Port::StringBase key = "stale text";
  use->GetDesignUnitKey(key);
  EXPECT_EQ(key, "Use");

  use->SetType(Vad::DbType::kLibrary);
  Port::StringBase prefix;
  use->AppendKeyPrefix(prefix);
  EXPECT_EQ(prefix, "|Library|");
}

TEST(DbObject, AnswersItsCounterItselfAndTheImplementationIdentityWithoutTakingReferences) {
  Owned<DbObject> object(new DbObject("x", nullptr));
  EXPECT_EQ(object->QueryInterface(CitI::IInterface::Iid()), object.Get());
  EXPECT_EQ(object->QueryInterface(Vad::InterfaceIds::ImplementationIdentity()), object.Get());
  EXPECT_NE(object->QueryInterface(Prjrep::IRefCount::Iid()), nullptr);
  EXPECT_EQ(object->QueryInterface(Prjrep::IPersist::Iid()), nullptr);
  EXPECT_EQ(Prjrep::RefCountOf(object.Get()), 1u);
  EXPECT_EQ(Prjrep::ImplementationCast<DbObject>(object.Get()), object.Get());
}

TEST(DbObject, ARecordBuiltUnderAParentIsItsLastChildWithASecondReference) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::CompInst> first(new Vad::CompInst("u1", "adder", architecture.Get()));
  Owned<Vad::CompInst> second(new Vad::CompInst("u2", "adder", architecture.Get()));

  EXPECT_EQ(Prjrep::RefCountOf(first.Get()), 2u);
  EXPECT_EQ(Prjrep::RefCountOf(second.Get()), 2u);
  EXPECT_EQ(Prjrep::RefCountOf(architecture.Get()), 1u);
  EXPECT_EQ(second->GetParent(), architecture.Get());
  EXPECT_EQ(ChildrenOf(*architecture), (std::vector<DbObject*>{first.Get(), second.Get()}));
}

TEST(DbObject, ReleasingTheParentReleasesEachChildOnceAndClearsTheirBackPointers) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::CompInst> kept(new Vad::CompInst("u1", "adder", architecture.Get()));
  { Owned<Vad::CompInst> onlyInParent(new Vad::CompInst("u2", "adder", architecture.Get())); }
  ASSERT_EQ(architecture->GetChildCount(), 2u);
  const long alive = Port::LiveObjectCount();

  architecture.Reset();
  EXPECT_EQ(Port::LiveObjectCount(), alive - 2);  // the architecture and u2
  EXPECT_EQ(Prjrep::RefCountOf(kept.Get()), 1u);
  EXPECT_EQ(kept->GetParent(), nullptr);
}

TEST(DbObject, SetParentDoesNotLeaveThePreviousParentsList) {
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

TEST(DbObject, SavingWithoutAParentWritesANullReferenceAndComplainsUnlessItIsAProject) {
  Owned<DbObject> project(new DbObject("project", nullptr));
  project->SetType(Vad::DbType::kProject);
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  {
    Port_DebugCapture debug;
    ScriptArchive archive;
    EXPECT_EQ(project->PersistObject(&archive, true), CitI::kOk);
    EXPECT_EQ(archive.log, (std::vector<std::string>{"WriteInt 1024", "WriteObjectRef null", "WriteInt 0",
                                                     "WriteString project", "WriteString ", "WriteBool 0"}));
    EXPECT_EQ(debug.text(), "");
  }
  Port_DebugCapture debug;
  ScriptArchive archive;
  EXPECT_EQ(entity->PersistObject(&archive, true), CitI::kOk);
  EXPECT_EQ(archive.Logged("WriteObjectRef"), std::vector<std::string>{"WriteObjectRef null"});
  EXPECT_EQ(debug.text(), "Error -- m_pParent can't be null\n");
}

TEST(DbObject, SavingRepairsAChildsBackPointerBeforeWritingTheChild) {
  Owned<Vad::Arch> saving(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::Arch> other(new Vad::Arch("counter", "fast", nullptr));
  Owned<Vad::CompInst> instance(new Vad::CompInst("u1", "adder", saving.Get()));
  other->AddChild(instance.Get());
  ASSERT_EQ(instance->GetParent(), other.Get());

  Port_DebugCapture debug;
  ScriptArchive archive;
  EXPECT_EQ(saving->PersistObject(&archive, true), CitI::kOk);
  EXPECT_EQ(instance->GetParent(), saving.Get());
  // The nested record names its repaired parent.
  EXPECT_EQ(archive.Logged("WriteObject"),
            (std::vector<std::string>{"WriteObjectRef null", "WriteObject u1", "WriteObjectRef rtl",
                                      "WriteObjectRef null"}));
}

TEST(DbObject, LoadingKeepsTheParentThatALoadedChildAlreadyHas) {
  Owned<Vad::Arch> loading(new Vad::Arch);
  Owned<Vad::Arch> elsewhere(new Vad::Arch("counter", "fast", nullptr));
  Owned<Vad::CompInst> orphan(new Vad::CompInst("u2", "adder", nullptr));
  Owned<Vad::CompInst> adopted(new Vad::CompInst("u1", "adder", elsewhere.Get()));

  ScriptArchive archive;
  ASSERT_EQ(archive.WriteInt(Vad::DbType::kArchitecture), CitI::kOk);
  ASSERT_EQ(archive.WriteObjectRef(nullptr), CitI::kOk);
  ASSERT_EQ(archive.WriteInt(2), CitI::kOk);
  archive.QueueObject(adopted.Get());
  archive.QueueObject(orphan.Get());
  ASSERT_EQ(archive.WriteString("rtl"), CitI::kOk);
  ASSERT_EQ(archive.WriteString("|Architecture||rtl|counter||"), CitI::kOk);
  ASSERT_EQ(archive.WriteBool(false), CitI::kOk);

  EXPECT_EQ(loading->PersistObject(&archive, false), CitI::kOk);
  EXPECT_EQ(loading->GetType(), Vad::DbType::kArchitecture);
  EXPECT_EQ(loading->GetName(), "rtl");
  EXPECT_EQ(loading->GetKey(), "|Architecture||rtl|counter||");
  EXPECT_EQ(ChildrenOf(*loading), (std::vector<DbObject*>{adopted.Get(), orphan.Get()}));
  EXPECT_EQ(adopted->GetParent(), elsewhere.Get());
  EXPECT_EQ(orphan->GetParent(), loading.Get());
  // The list holds the reference that each read handed over.
  EXPECT_EQ(Prjrep::RefCountOf(orphan.Get()), 2u);
}

TEST(DbObject, AnUnreadableParentIsReportedAfterLoadingTheRest) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl);
  ScriptArchive archive;
  ASSERT_EQ(archive.WriteInt(Vad::DbType::kEntity), CitI::kOk);
  ASSERT_EQ(archive.WriteInt(0), CitI::kOk);
  ASSERT_EQ(archive.WriteString("counter"), CitI::kOk);
  ASSERT_EQ(archive.WriteString("|Entity||counter"), CitI::kOk);
  ASSERT_EQ(archive.WriteBool(false), CitI::kOk);
  archive.log.clear();
  archive.failAt = 1;  // the parent reference

  Port_DebugCapture debug;
  EXPECT_EQ(entity->PersistObject(&archive, false), CitI::kOk);
  EXPECT_EQ(entity->GetName(), "counter");
  EXPECT_EQ(entity->GetParent(), nullptr);
  EXPECT_EQ(debug.text(), "DBObject m_pParent bad for counter |Entity||counter\n");
}

TEST(DbObject, ArchiveFailuresStopAndComeBackUnchanged) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::CompInst> instance(new Vad::CompInst("u1", "adder", architecture.Get()));
  Port_DebugCapture debug;
  ScriptArchive complete;
  ASSERT_EQ(architecture->PersistObject(&complete, true), CitI::kOk);
  for (int failAt = 0; failAt < static_cast<int>(complete.log.size()); ++failAt) {
    ScriptArchive archive;
    archive.failAt = failAt;
    EXPECT_EQ(architecture->PersistObject(&archive, true), ScriptArchive::kFailCode) << failAt;
    EXPECT_EQ(archive.log.size(), static_cast<std::size_t>(failAt) + 1) << failAt;
  }
  EXPECT_EQ(architecture->PersistObject(nullptr, true), CitI::kInvalidArg);
}
