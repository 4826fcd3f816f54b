// Every record class through a file archive of each version, and archives that break off.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Arch.h"
#include "CompInst.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "ITimestamp.h"
#include "Library.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "Port/FileArchive.h"
#include "Port/MsgManData.h"
#include "Port/SafeCount.h"
#include "Prjrep/RefCounting.h"
#include "ScopedTempDir.h"
#include "TestHost.h"
#include "Use.h"
#include "generic.h"
#include "module.h"

using Prjrep::QueryAs;
using test_host::Owned;

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

  Design() {
    instance->SetLabel("u2");
    instance->SetEntityName("adder");
    instance->SetArchitectureName("fast");
    architecture->SetUses({use.Get()});
    const auto compose = [](auto&... records) {
      Port::StringBase key;
      (records->ComposeStoreKey(key), ...);
    };
    compose(library, entity, architecture, component, instance, package, body, use, width, top,
            moduleInstance);
    std::uint32_t seed = 1;
    for (Vad::CHdlElement* element : All()) Decorate(*element, seed++);
    // A reference back to a record written before, and one to a record written after.
    QueryAs<Vad::IHdlClientData>(top.Get())->SetClientData(library.Get());
    QueryAs<Vad::IHdlClientData>(entity.Get())->SetClientData(width.Get());
  }

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

  static void Decorate(Vad::CHdlElement& element, std::uint32_t seed) {
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
};

// The fields of the record's own class, joined by "|".
std::string ClassFieldsOf(Vad::CHdlElement* record) {
  const auto join = [](std::initializer_list<Port::StringBase> fields) {
    std::string text;
    for (const Port::StringBase& field : fields) text += (text.empty() ? "" : "|") + field.str();
    return text;
  };
  if (auto* r = dynamic_cast<Vad::Library*>(record)) return join({r->GetLibraryText()});
  if (auto* r = dynamic_cast<Vad::EntityDecl*>(record)) return join({r->GetEntityName()});
  if (auto* r = dynamic_cast<Vad::Arch*>(record))
    return join({r->GetEntityName(), r->GetArchitectureName(), r->GetReservedA(), r->GetReservedB()});
  if (auto* r = dynamic_cast<Vad::PackageDecl*>(record)) return join({"decl", r->GetPackageName()});
  if (auto* r = dynamic_cast<Vad::PackageBody*>(record)) return join({"body", r->GetPackageName()});
  if (auto* r = dynamic_cast<Vad::Use*>(record))
    return join({r->GetLibraryPart(), r->GetPackagePart(), r->GetItemPart()});
  if (auto* r = dynamic_cast<Vad::generic*>(record)) return join({r->GetGenericName()});
  if (auto* r = dynamic_cast<Vad::module*>(record)) return join({r->GetModuleName()});
  if (auto* r = dynamic_cast<Vad::CompInst*>(record)) return join({r->GetLabel(), r->GetComponentName()});
  if (auto* r = dynamic_cast<Vad::EntityInst*>(record))
    return join({r->GetLabel(), r->GetEntityName(), r->GetReserved(), r->GetArchitectureName()});
  return "?";
}

// Every field a record keeps through an archive of `version`, with the version's defaults for those
// it does not keep yet (properties from 3, the generate flag from 9); the host text is never kept.
std::string ArchivedFieldsOf(Vad::CHdlElement* record, std::int32_t version) {
  Port::XUID instanceId;
  QueryAs<Prjrep::IPersist>(record)->GetInstanceXUID(&instanceId);
  std::int64_t seconds = 0, microseconds = 0;
  QueryAs<Prjrep::ITimestamp>(record)->GetTime(&seconds, &microseconds);
  Port::StringBase designUnitKey;
  record->GetDesignUnitKey(designUnitKey);
  std::string text = typeid(*record).name() + std::string(" ") + ClassFieldsOf(record) + " type " +
                     std::to_string(record->GetType()) + " " + record->GetName().str() + " " +
                     record->GetKey().str() + " " + designUnitKey.str() + " " + instanceId.ToString() + " " +
                     std::to_string(seconds) + "." + std::to_string(microseconds) + " " +
                     record->GetDesignUnitTypeId().ToString();
  for (std::uint32_t value : {record->GetLine(), record->GetColumn(), record->GetX(), record->GetY()})
    text += " " + std::to_string(value);
  text += record->GetUnitFlag() ? " unit" : "";
  if (version >= 3)
    for (const auto& [key, value] : record->GetProperties()) text += " " + key.str() + "=" + value.str();
  return text + (record->IsInGenerate() && version >= 9 ? " generate" : "");
}

class RecordPersistence : public test_host::RegisteredModule,
                          public testing::WithParamInterface<std::int32_t> {
 protected:
  std::vector<Owned<CitI::IInterface>> SaveAndLoad(const Design& design) {
    ScopedTempDir dir;
    const std::string path = dir.Path("design.qar");
    Port::StringBase error;
    auto writing = Port::FileArchive::CreateForWrite(path.c_str(), GetParam(), &error);
    EXPECT_TRUE(writing) << error.str();
    const std::string written = test_host::DebugTextOf([&] {
      for (Vad::CHdlElement* root : design.Roots())
        EXPECT_EQ(writing->WriteObject(QueryAs<Prjrep::IPersist>(root)), CitI::kOk) << root->GetName().str();
    });
    EXPECT_EQ(written.size(),
              design.Roots().size() * std::string("Error -- m_pParent can't be null\n").size())
        << "each parentless root is reported once";
    EXPECT_EQ(Prjrep::ObjectCast<Port::FileArchive>(writing.Get())->Close(), CitI::kOk);

    auto reading = Port::FileArchive::OpenForRead(path.c_str(), &error);
    EXPECT_TRUE(reading) << error.str();
    std::vector<Owned<CitI::IInterface>> roots(design.Roots().size());
    if (!reading) return roots;
    for (auto& root : roots) EXPECT_EQ(reading->ReadObject(root.Out()), CitI::kOk);
    auto* file = Prjrep::ObjectCast<Port::FileArchive>(reading.Get());
    EXPECT_EQ(file->Close(), CitI::kOk) << file->LastError().str();
    return roots;
  }

  static Vad::CHdlElement* ChildOf(Vad::CHdlElement* parent, std::size_t index) {
    std::vector<Vad::DbObject*> children;
    for (Vad::DbObject* child : parent->GetChildren()) children.push_back(child);
    return index < children.size() ? dynamic_cast<Vad::CHdlElement*>(children[index]) : nullptr;
  }

  static CitI::IInterface* ClientDataOf(Vad::CHdlElement* element) {
    Owned<CitI::IInterface> data;
    QueryAs<Vad::IHdlClientData>(element)->GetClientData(data.Out());
    return data.Get();
  }
};

TEST_P(RecordPersistence, EveryRecordClassComesBackWithItsFieldsAndLinks) {
  Port_DebugCapture debug;
  const Design saved;
  auto roots = SaveAndLoad(saved);
  if (HasFailure()) return;

  std::vector<Vad::CHdlElement*> loaded;
  for (auto& root : roots) loaded.push_back(Prjrep::ImplementationCast<Vad::CHdlElement>(root.Get()));
  // Children come back owned by their new parents, with the back pointers set.
  const std::vector<Vad::CHdlElement*> loadedChildren{ChildOf(loaded[2], 0), ChildOf(loaded[2], 1),
                                                      ChildOf(loaded[7], 0)};
  ASSERT_EQ(ChildOf(loaded[2], 2), nullptr);
  ASSERT_EQ(ChildOf(loaded[7], 1), nullptr);
  loaded.insert(loaded.end(), loadedChildren.begin(), loadedChildren.end());
  const std::vector<Vad::CHdlElement*> all = saved.All();
  const char* const classFields[] = {
      "work",  "counter", "counter|rtl||", "decl|types",     "body|types", "ieee|std_logic_1164|all",
      "WIDTH", "top",     "u1|adder",      "u2|adder||fast", "u3|adder"};
  for (std::size_t i = 0; i < all.size(); ++i) {
    ASSERT_NE(loaded[i], nullptr) << i;
    EXPECT_NE(loaded[i], all[i]);
    EXPECT_EQ(ClassFieldsOf(all[i]), classFields[i]);
    EXPECT_EQ(ArchivedFieldsOf(loaded[i], 9), ArchivedFieldsOf(all[i], GetParam()));
    EXPECT_EQ(loaded[i]->GetReservedValue(), 4);
    EXPECT_EQ(loaded[i]->GetHostText(), "");
    EXPECT_EQ(loaded[i]->GetParent(), i < 8 ? nullptr : i < 10 ? loaded[2] : loaded[7]);
  }
  EXPECT_EQ(Prjrep::RefCountOf(loaded[8]), 1u) << "held by its parent alone";
  std::vector<Vad::DbObject*> uses{loaded[5]};
  dynamic_cast<Vad::Arch*>(loaded[2])->GetUses(uses);
  EXPECT_TRUE(uses.empty()) << "use lists are not persisted";

  // Client data references resolve to the loaded objects, backwards and forwards.
  EXPECT_EQ(ClientDataOf(loaded[7]), roots[0].Get());
  EXPECT_EQ(ClientDataOf(loaded[1]), roots[6].Get());
  EXPECT_EQ(Prjrep::RefCountOf(loaded[0]), 2u) << "the caller and the client-data link";

  // Releasing the loaded roots frees everything that was loaded.
  const long alive = Port::LiveObjectCount();
  roots.clear();
  EXPECT_EQ(Port::LiveObjectCount(), alive - 11);
}

INSTANTIATE_TEST_SUITE_P(ArchiveVersions, RecordPersistence, testing::Values(2, 5, 9),
                         [](const testing::TestParamInfo<std::int32_t>& info) {
                           return "Version" + std::to_string(info.param);
                         });

class BrokenArchive : public test_host::RegisteredModule {};

TEST_F(BrokenArchive, AnArchiveThatBreaksOffLeavesNoObjectBehind) {
  ScopedTempDir dir;
  const std::string path = dir.Path("broken.qar");
  Port_DebugCapture debug;
  {
    const Design saved;
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

}  // namespace
