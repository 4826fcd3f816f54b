#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Arch.h"
#include "CompInst.h"
#include "DatabaseFixtures.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "ITimestamp.h"
#include "Library.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "Port/FileArchive.h"
#include "Port/MsgManData.h"
#include "Prjrep/RefCounting.h"
#include "ScopedTempDir.h"
#include "Use.h"
#include "generic.h"
#include "module.h"

using namespace database_test;
using Prjrep::QueryAs;

namespace {

// One record of every class, with every element field set to a value of its own.
struct Design {
  Owned<Vad::Library> library{new Vad::Library("work", nullptr)};
  Owned<Vad::EntityDecl> entity{new Vad::EntityDecl("counter", nullptr)};
  Owned<Vad::Arch> architecture{new Vad::Arch("counter", "rtl", nullptr)};
  Owned<Vad::CompInst> component{new Vad::CompInst("u1", "adder", architecture.Get())};
  Owned<Vad::EntityInst> instance{new Vad::EntityInst("u2", architecture.Get())};
  Owned<Vad::PackageDecl> package{new Vad::PackageDecl("types", nullptr)};
  Owned<Vad::PackageBody> body{new Vad::PackageBody("types", nullptr)};
  Owned<Vad::Use> use{new Vad::Use("ieee.std_logic_1164.all", nullptr)};
  Owned<Vad::generic> width{new Vad::generic("WIDTH", nullptr)};
  Owned<Vad::module> top{new Vad::module("top", nullptr)};
  Owned<Vad::CompInst> moduleInstance{new Vad::CompInst("u3", "adder", top.Get())};

  // The objects an archive holds as roots, in writing order; the instances are their parents'.
  std::vector<Vad::CHdlElement*> Roots() const {
    return {library.Get(), entity.Get(), architecture.Get(), package.Get(),
            body.Get(),    use.Get(),    width.Get(),        top.Get()};
  }
  std::vector<Vad::CHdlElement*> All() const {
    auto all = Roots();
    all.insert(all.end(), {component.Get(), instance.Get(), moduleInstance.Get()});
    return all;
  }
};

void Decorate(Vad::CHdlElement& element, std::uint32_t seed) {
  element.SetDesignUnitTypeId(Port::XUID(0x1000 + seed, 0x2000 + seed));
  element.SetTextPosition(10 + seed, seed);
  element.SetGraphicsPosition(100 + seed, 200 + seed);
  element.SetUnitFlag(seed % 2 == 1);
  element.SetInGenerate(true);
  element.SetProperty("PARTITION", "p" + std::to_string(seed));
  element.SetProperty("index", std::to_string(seed));
  QueryAs<Vad::IDesignUnit>(&element)->SetHostText("not kept");
  QueryAs<Prjrep::ITimestamp>(&element)->SetTime(1700000000 + seed, 1000 * seed);
}

Design MakeDesign() {
  Design design;
  design.instance->SetLabel("u2");
  design.instance->SetEntityName("adder");
  design.instance->SetArchitectureName("fast");
  design.architecture->SetUses({design.use.Get()});
  Port::StringBase key;
  design.library->ComposeStoreKey(key);
  design.entity->ComposeStoreKey(key);
  design.architecture->ComposeStoreKey(key);
  design.component->ComposeStoreKey(key);
  design.instance->ComposeStoreKey(key);
  design.package->ComposeStoreKey(key);
  design.body->ComposeStoreKey(key);
  design.use->ComposeStoreKey(key);
  design.width->ComposeStoreKey(key);
  design.top->ComposeStoreKey(key);
  design.moduleInstance->ComposeStoreKey(key);
  std::uint32_t seed = 1;
  for (Vad::CHdlElement* element : design.All()) Decorate(*element, seed++);
  // A reference back to a record written before, and one to a record written after.
  QueryAs<Vad::IHdlClientData>(design.top.Get())->SetClientData(design.library.Get());
  QueryAs<Vad::IHdlClientData>(design.entity.Get())->SetClientData(design.width.Get());
  return design;
}

struct Timestamp {
  std::int64_t seconds = 0;
  std::int64_t microseconds = 0;
  bool operator==(const Timestamp&) const = default;
};

Timestamp TimeOf(Vad::CHdlElement* element) {
  Timestamp time;
  QueryAs<Prjrep::ITimestamp>(element)->GetTime(&time.seconds, &time.microseconds);
  return time;
}

Port::XUID InstanceIdOf(Vad::CHdlElement* element) {
  Port::XUID id;
  QueryAs<Prjrep::IPersist>(element)->GetInstanceXUID(&id);
  return id;
}

CitI::IInterface* ClientDataOf(Vad::CHdlElement* element) {
  Owned<CitI::IInterface> data;
  QueryAs<Vad::IHdlClientData>(element)->GetClientData(data.Out());
  return data.Get();
}

std::vector<Vad::DbObject*> ChildrenOf(const Vad::DbObject& object) {
  std::vector<Vad::DbObject*> children;
  for (Vad::DbObject* child : object.GetChildren()) children.push_back(child);
  return children;
}

class RecordPersistence : public RegisteredModule, public testing::WithParamInterface<std::int32_t> {
 protected:
  void Save(const Design& design, const std::string& path) {
    Port::StringBase error;
    auto archive = Port::FileArchive::CreateForWrite(path.c_str(), GetParam(), &error);
    ASSERT_TRUE(archive) << error.str();
    for (Vad::CHdlElement* root : design.Roots())
      ASSERT_EQ(archive->WriteObject(QueryAs<Prjrep::IPersist>(root)), CitI::kOk) << root->GetName().str();
    ASSERT_EQ(Prjrep::ObjectCast<Port::FileArchive>(archive.Get())->Close(), CitI::kOk);
  }

  // The roots read back, re-created through the registry, each with the caller's reference.
  std::vector<Owned<CitI::IInterface>> Load(const std::string& path, std::size_t count) {
    Port::StringBase error;
    auto archive = Port::FileArchive::OpenForRead(path.c_str(), &error);
    EXPECT_TRUE(archive) << error.str();
    std::vector<Owned<CitI::IInterface>> roots(count);
    if (!archive) return roots;
    for (auto& root : roots) EXPECT_EQ(archive->ReadObject(root.Out()), CitI::kOk);
    auto* file = Prjrep::ObjectCast<Port::FileArchive>(archive.Get());
    EXPECT_EQ(file->Close(), CitI::kOk) << file->LastError().str();
    return roots;
  }

  void ExpectSameElement(Vad::CHdlElement* saved, Vad::CHdlElement* loaded) {
    const std::string name = saved->GetName().str();
    ASSERT_NE(loaded, nullptr) << name;
    EXPECT_NE(loaded, saved) << name;
    EXPECT_EQ(typeid(*loaded), typeid(*saved)) << name;
    EXPECT_EQ(loaded->GetType(), saved->GetType()) << name;
    EXPECT_EQ(loaded->GetName(), saved->GetName()) << name;
    EXPECT_EQ(loaded->GetKey(), saved->GetKey()) << name;
    EXPECT_EQ(InstanceIdOf(loaded), InstanceIdOf(saved)) << name;
    EXPECT_EQ(TimeOf(loaded), TimeOf(saved)) << name;
    EXPECT_EQ(loaded->GetDesignUnitTypeId(), saved->GetDesignUnitTypeId()) << name;
    EXPECT_EQ(loaded->GetLine(), saved->GetLine()) << name;
    EXPECT_EQ(loaded->GetColumn(), saved->GetColumn()) << name;
    EXPECT_EQ(loaded->GetX(), saved->GetX()) << name;
    EXPECT_EQ(loaded->GetY(), saved->GetY()) << name;
    EXPECT_EQ(loaded->GetReservedValue(), 4) << name;
    EXPECT_EQ(loaded->GetUnitFlag(), saved->GetUnitFlag()) << name;
    EXPECT_EQ(loaded->GetHostText(), "") << name;
    if (GetParam() >= 3) {
      EXPECT_EQ(loaded->GetProperties(), saved->GetProperties()) << name;
    } else {
      EXPECT_TRUE(loaded->GetProperties().empty()) << name;
    }
    EXPECT_EQ(loaded->IsInGenerate(), GetParam() >= 9) << name;
    Port::StringBase savedKey;
    Port::StringBase loadedKey;
    saved->GetDesignUnitKey(savedKey);
    loaded->GetDesignUnitKey(loadedKey);
    EXPECT_EQ(loadedKey, savedKey) << name;
  }
};

}  // namespace

TEST_P(RecordPersistence, EveryRecordClassComesBackWithItsFieldsAndLinks) {
  ScopedTempDir dir;
  const std::string path = dir.Path("design.qar");
  Port_DebugCapture debug;
  const Design saved = MakeDesign();
  Save(saved, path);
  EXPECT_EQ(debug.text().size(),
            saved.Roots().size() * std::string("Error -- m_pParent can't be null\n").size())
      << "each parentless root is reported once";

  auto roots = Load(path, saved.Roots().size());
  const std::vector<Vad::CHdlElement*> savedRoots = saved.Roots();
  std::vector<Vad::CHdlElement*> loaded;
  for (std::size_t i = 0; i < roots.size(); ++i) {
    loaded.push_back(Prjrep::ImplementationCast<Vad::CHdlElement>(roots[i].Get()));
    ExpectSameElement(savedRoots[i], loaded[i]);
    EXPECT_EQ(loaded[i]->GetParent(), nullptr);
  }
  if (HasFatalFailure()) return;

  auto* library = dynamic_cast<Vad::Library*>(loaded[0]);
  auto* entity = dynamic_cast<Vad::EntityDecl*>(loaded[1]);
  auto* architecture = dynamic_cast<Vad::Arch*>(loaded[2]);
  auto* package = dynamic_cast<Vad::PackageDecl*>(loaded[3]);
  auto* body = dynamic_cast<Vad::PackageBody*>(loaded[4]);
  auto* use = dynamic_cast<Vad::Use*>(loaded[5]);
  auto* width = dynamic_cast<Vad::generic*>(loaded[6]);
  auto* top = dynamic_cast<Vad::module*>(loaded[7]);
  ASSERT_TRUE(library && entity && architecture && package && body && use && width && top);

  EXPECT_EQ(library->GetLibraryText(), "work");
  EXPECT_EQ(entity->GetEntityName(), "counter");
  EXPECT_EQ(architecture->GetEntityName(), "counter");
  EXPECT_EQ(architecture->GetArchitectureName(), "rtl");
  EXPECT_EQ(architecture->GetReservedA(), "");
  EXPECT_EQ(architecture->GetReservedB(), "");
  EXPECT_EQ(package->GetPackageName(), "types");
  EXPECT_EQ(body->GetPackageName(), "types");
  EXPECT_EQ(use->GetLibraryPart(), "ieee");
  EXPECT_EQ(use->GetPackagePart(), "std_logic_1164");
  EXPECT_EQ(use->GetItemPart(), "all");
  EXPECT_EQ(width->GetGenericName(), "WIDTH");
  EXPECT_EQ(top->GetModuleName(), "top");

  std::vector<Vad::DbObject*> uses{use};
  architecture->GetUses(uses);
  EXPECT_TRUE(uses.empty()) << "use lists are not persisted";

  // Children come back owned by their new parents, with the back pointers set.
  const std::vector<Vad::DbObject*> archChildren = ChildrenOf(*architecture);
  ASSERT_EQ(archChildren.size(), 2u);
  auto* component = dynamic_cast<Vad::CompInst*>(archChildren[0]);
  auto* instance = dynamic_cast<Vad::EntityInst*>(archChildren[1]);
  ASSERT_TRUE(component && instance);
  ExpectSameElement(saved.component.Get(), component);
  ExpectSameElement(saved.instance.Get(), instance);
  EXPECT_EQ(component->GetParent(), architecture);
  EXPECT_EQ(instance->GetParent(), architecture);
  EXPECT_EQ(component->GetLabel(), "u1");
  EXPECT_EQ(component->GetComponentName(), "adder");
  EXPECT_EQ(instance->GetLabel(), "u2");
  EXPECT_EQ(instance->GetEntityName(), "adder");
  EXPECT_EQ(instance->GetReserved(), "");
  EXPECT_EQ(instance->GetArchitectureName(), "fast");
  EXPECT_EQ(Prjrep::RefCountOf(component), 1u) << "held by its parent alone";

  const std::vector<Vad::DbObject*> topChildren = ChildrenOf(*top);
  ASSERT_EQ(topChildren.size(), 1u);
  auto* moduleInstance = dynamic_cast<Vad::CompInst*>(topChildren[0]);
  ASSERT_NE(moduleInstance, nullptr);
  ExpectSameElement(saved.moduleInstance.Get(), moduleInstance);
  EXPECT_EQ(moduleInstance->GetParent(), top);

  // Client data references resolve to the loaded objects, backwards and forwards.
  EXPECT_EQ(ClientDataOf(top), roots[0].Get());
  EXPECT_EQ(ClientDataOf(entity), roots[6].Get());
  EXPECT_EQ(Prjrep::RefCountOf(library), 2u) << "the caller and the client-data link";

  // Releasing the loaded roots frees everything that was loaded.
  const long alive = Port::LiveObjectCount();
  roots.clear();
  EXPECT_EQ(Port::LiveObjectCount(), alive - 11);
}

INSTANTIATE_TEST_SUITE_P(ArchiveVersions, RecordPersistence, testing::Values(2, 5, 9),
                         [](const testing::TestParamInfo<std::int32_t>& info) {
                           return "Version" + std::to_string(info.param);
                         });

TEST_F(RegisteredModule, AnArchiveThatBreaksOffLeavesNoObjectBehind) {
  ScopedTempDir dir;
  const std::string path = dir.Path("broken.qar");
  Port_DebugCapture debug;
  {
    const Design saved = MakeDesign();
    auto archive = Port::FileArchive::CreateForWrite(path.c_str());
    ASSERT_TRUE(archive);
    ASSERT_EQ(archive->WriteObject(QueryAs<Prjrep::IPersist>(saved.architecture.Get())), CitI::kOk);
    ASSERT_EQ(Prjrep::ObjectCast<Port::FileArchive>(archive.Get())->Close(), CitI::kOk);
  }
  std::string bytes;
  {
    Port::StringBase error;
    auto archive = Port::FileArchive::OpenForRead(path.c_str(), &error);
    ASSERT_TRUE(archive) << error.str();
    bytes = std::string(Prjrep::ObjectCast<Port::FileArchive>(archive.Get())->Bytes());
  }
  for (std::size_t length = bytes.size() - 1; length > 16; length -= 7) {
    Port::StringBase error;
    auto archive = Port::FileArchive::OpenFromBytes(std::string_view(bytes).substr(0, length), &error);
    if (!archive) continue;
    Owned<CitI::IInterface> root;
    EXPECT_NE(archive->ReadObject(root.Out()), CitI::kOk) << length;
  }
}
