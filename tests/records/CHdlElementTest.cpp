#include <gtest/gtest.h>

#include <vector>

#include "Arch.h"
#include "CHdlElement.h"
#include "CompInst.h"
#include "EntityDecl.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "Host/SourceLibrary.h"
#include "IBaseServices.h"
#include "IEventSender.h"
#include "ITimestamp.h"
#include "Library.h"
#include "PackageDecl.h"
#include "Port/MsgManData.h"
#include "Prjrep/RefCounting.h"
#include "Prjrep/TRefCountHelper.h"
#include "Prjrep/TSequenceSetHelper.h"
#include "TFactory.h"
#include "TestHost.h"
#include "module.h"

using Prjrep::QueryAs;
using test_host::DebugTextOf;
using test_host::Owned;

namespace {

class CountingReceiver final : public Prjrep::IEventReceiver {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == IEventReceiver::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result OnEvent(CitI::IInterface*) override { return CitI::kOk; }
  CitI::Result OnAttach(Prjrep::IEventSender*) override { return ++attaches, CitI::kOk; }
  CitI::Result OnDetach(Prjrep::IEventSender*) override { return ++detaches, CitI::kOk; }
  int attaches = 0;
  int detaches = 0;
};

// Base services whose data-store request always fails.
class RefusingBaseServices final : public Vad::IBaseServices {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IBaseServices::Iid() || id == CitI::IInterface::Iid()) return this;
    return id == Prjrep::IRefCount::Iid() ? &refs_ : nullptr;
  }
  CitI::Result GetService(const Port::XUID&, CitI::IInterface** out) override {
    *out = nullptr;
    return CitI::kFail;
  }

 private:
  Prjrep::TRefCountHelper<RefusingBaseServices> refs_{this};
};

// A source library that has no name interface.
class NamelessLibrary final : public Vad::ISourceLibrary {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == ISourceLibrary::Iid() || id == CitI::IInterface::Iid()) return this;
    return id == Prjrep::IRefCount::Iid() ? &refs_ : nullptr;
  }
  CitI::Result GetName(Port::StringBase* out) override {
    *out = "hidden";
    return CitI::kOk;
  }
  CitI::Result SetName(const Port::StringBase&) override { return CitI::kOk; }

 private:
  Prjrep::TRefCountHelper<NamelessLibrary> refs_{this};
};

std::string NameOf(CitI::IInterface* element) {
  Port::StringBase name = "stale";
  EXPECT_EQ(QueryAs<Prjrep::IName>(element)->GetName(&name), CitI::kOk);
  return name.str();
}

// An entity "counter" and a source file of the module's own, not yet linked.
class Element : public test_host::PipelineTest {
 protected:
  Prjrep::AutoPtr<Vad::IHdlProject> project_ = NewProject();
  Prjrep::AutoPtr<Vad::IHdlFile> file_ = NewFile(project_.Get(), "/p/counter.vhd", "PLUGIN_Vhdl");
  Owned<Vad::EntityDecl> entity_{new Vad::EntityDecl("counter", nullptr)};
};

// Host components registered for one test, so that a test may replace them.
class HostServices : public testing::Test {
 protected:
  void SetUp() override { ASSERT_TRUE(Host::RegisterHostComponents()); }
  void TearDown() override { RavA::Factory::Clear(); }
  Owned<Vad::EntityDecl> entity_{new Vad::EntityDecl("counter", nullptr)};
};

TEST(CHdlElement, PositionsTypeIdentifierAndInstanceFlagReachTheHostThroughTheirFaces) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::CompInst> instance(new Vad::CompInst("u1", "adder", architecture.Get()));
  const Port::XUID typeId("{6DCC6CCB-40B6-4f09-9AB3-C3593438F5B2}");
  instance->SetTextPosition(12, 3);
  instance->SetGraphicsPosition(40, 50);
  instance->SetDesignUnitTypeId(typeId);
  instance->SetInGenerate(true);

  std::uint32_t line = 0, column = 0, x = 0, y = 0;
  auto* text = QueryAs<Vad::IHdlTextPosition>(instance.Get());
  EXPECT_EQ(text->GetLine(&line), CitI::kOk);
  EXPECT_EQ(text->GetColumn(&column), CitI::kOk);
  EXPECT_EQ(text->GetLine(nullptr), CitI::kInvalidArg);
  auto* graphics = QueryAs<Vad::IHdlGraphicsPosition>(instance.Get());
  EXPECT_EQ(graphics->GetX(&x), CitI::kOk);
  EXPECT_EQ(graphics->GetY(&y), CitI::kOk);
  EXPECT_EQ((std::vector<std::uint32_t>{line, column, x, y}), (std::vector<std::uint32_t>{12, 3, 40, 50}));
  Port::XUID reported;
  auto* designUnit = QueryAs<Vad::IHdlDesignUnit>(instance.Get());
  EXPECT_EQ(designUnit->GetDesignUnitTypeId(&reported), CitI::kOk);
  EXPECT_EQ(reported, typeId);
  bool inGenerate = false;
  EXPECT_EQ(QueryAs<Vad::IInstanceData>(instance.Get())->GetInGenerate(&inGenerate), CitI::kOk);
  EXPECT_TRUE(inGenerate);

  Vad::IHdlDesignUnit* self = nullptr;
  EXPECT_EQ(designUnit->GetDesignUnit(nullptr, nullptr), CitI::kOk);
  EXPECT_EQ(designUnit->GetDesignUnit(nullptr, &self), CitI::kOk);
  Owned<Vad::IHdlDesignUnit> selfHeld(self);
  EXPECT_EQ(self, designUnit);
  EXPECT_EQ(Prjrep::RefCountOf(instance.Get()), 3u);  // creator, parent, out-parameter
}

TEST(CHdlElement, PropertiesRefuseEmptyKeysReplaceValuesAndKeepByteOrder) {
  Owned<Vad::module> top(new Vad::module("top", nullptr));
  auto* properties = QueryAs<Vad::IHdlDUProperties>(top.Get());
  Port::StringBase value = "stale";
  EXPECT_EQ(properties->GetProperty("", &value), CitI::kFail);
  EXPECT_EQ(value, "");
  EXPECT_EQ(properties->SetProperty("", "x"), CitI::kFail);
  EXPECT_EQ(properties->RemoveProperty(""), CitI::kFail);
  EXPECT_EQ(properties->GetProperty("PARTITION", nullptr), CitI::kInvalidArg);

  for (const char* key : {"PARTITION", "PARTITION", "ab", "a"})
    EXPECT_EQ(properties->SetProperty(key, key), CitI::kOk);
  EXPECT_EQ(properties->SetProperty("PARTITION", "p2"), CitI::kOk);
  value = "stale";
  EXPECT_EQ(properties->GetProperty("PARTITION", &value), CitI::kOk);
  EXPECT_EQ(value, "p2");
  EXPECT_EQ(properties->GetProperty("missing", &value), CitI::kFail);
  EXPECT_EQ(value, "");
  std::vector<std::string> keys;
  for (const auto& [key, ignored] : top->GetProperties()) keys.push_back(key.str());
  EXPECT_EQ(keys, (std::vector<std::string>{"PARTITION", "a", "ab"}));

  EXPECT_EQ(properties->RemoveProperty("missing"), CitI::kFail);
  EXPECT_EQ(properties->RemoveProperty("a"), CitI::kOk);
  EXPECT_EQ(properties->GetProperty("a", &value), CitI::kFail);
  EXPECT_EQ(top->GetProperties().size(), 2u);
}

TEST(CHdlElement, UnitFlagsBelongToEntitiesModulesAndTheEntitiesOfArchitectures) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::module> top(new Vad::module("top", nullptr));
  Owned<Vad::PackageDecl> package(new Vad::PackageDecl("types", nullptr));
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  entity->SetUnitFlag(true);
  const auto flagOf = [](Vad::CHdlElement* unit, bool* flag) {
    return QueryAs<Vad::IHdlDesignUnit>(unit)->GetUnitFlag(0, flag);
  };
  bool flag = false;
  EXPECT_EQ(flagOf(entity.Get(), &flag), CitI::kOk);
  EXPECT_TRUE(flag);
  EXPECT_EQ(flagOf(entity.Get(), nullptr), CitI::kFail);
  flag = true;
  EXPECT_EQ(flagOf(top.Get(), &flag), CitI::kOk);
  EXPECT_FALSE(flag);

  flag = true;
  EXPECT_EQ(flagOf(package.Get(), &flag), 4);
  EXPECT_TRUE(flag) << "left alone";
  // Without a source file the architecture's entity cannot be looked up.
  EXPECT_EQ(flagOf(architecture.Get(), &flag), CitI::kFail);
  EXPECT_TRUE(flag) << "left alone";
}

TEST(CHdlElement, FindsTheFirstEntityOfAnArchitectureAmongUnits) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::PackageDecl> sameName(new Vad::PackageDecl("counter", nullptr));
  Owned<Vad::EntityDecl> other(new Vad::EntityDecl("other", nullptr));
  Owned<Vad::EntityDecl> first(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::EntityDecl> second(new Vad::EntityDecl("counter", nullptr));
  auto units = Prjrep::TRefdSequenceSetHelper<Vad::IHdlDesignUnitSet>::New();
  for (Vad::CHdlElement* unit : std::vector<Vad::CHdlElement*>{architecture.Get(), sameName.Get(),
                                                               other.Get(), first.Get(), second.Get()}) {
    units->Add(QueryAs<Vad::IHdlDesignUnit>(unit));
  }
  Vad::CHdlElement* found = nullptr;
  EXPECT_EQ(Vad::CHdlElement::FindEntityAmong(units.Get(), "counter", &found), CitI::kOk);
  EXPECT_EQ(found, first.Get());
  EXPECT_EQ(Vad::CHdlElement::FindEntityAmong(units.Get(), "adder", &found), 2);
  EXPECT_EQ(found, nullptr);

  EXPECT_EQ(architecture->FindEntity(0, architecture.Get(), nullptr), CitI::kFail);
  EXPECT_EQ(architecture->FindEntity(0, nullptr, &found), CitI::kFail);
  found = first.Get();
  EXPECT_EQ(architecture->FindEntity(0, architecture.Get(), &found), CitI::kFail) << "no source file";
  EXPECT_EQ(found, nullptr);
}

TEST(CHdlElement, NameFaceGivesTheDesignUnitKeyAndIgnoresNewNames) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Library> library(new Vad::Library("work", nullptr));
  EXPECT_EQ(NameOf(entity.Get()), "Entity|counter");
  EXPECT_EQ(NameOf(library.Get()), "Library");
  EXPECT_EQ(QueryAs<Prjrep::IName>(entity.Get())->SetName("renamed"), CitI::kOk);
  EXPECT_EQ(NameOf(entity.Get()), "Entity|counter");
  EXPECT_EQ(QueryAs<Prjrep::IName>(entity.Get())->GetName(nullptr), CitI::kInvalidArg);
}

TEST_F(Element, ElementFaceHandsOutItsFileAndProvidesNoView) {
  auto* element = QueryAs<Vad::IHdlElement>(entity_.Get());
  Vad::IHdlFile* none = file_.Get();
  EXPECT_EQ(element->GetFile(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(element->GetFile(&none), CitI::kOk);
  EXPECT_EQ(none, nullptr);

  entity_->SetFile(file_.Get());
  Owned<Vad::IHdlFile> held;
  EXPECT_EQ(element->GetSourceFile(held.Out()), CitI::kOk);
  EXPECT_EQ(held.Get(), file_.Get());
  EXPECT_EQ(Prjrep::RefCountOf(file_.Get()), 2u) << "the element keeps none, the caller one";
  Owned<CitI::IInterface> object;
  EXPECT_EQ(entity_->GetFileObject(object.Out()), CitI::kOk);
  EXPECT_EQ(object.Get(), QueryAs<CitI::IInterface>(file_.Get()));
  EXPECT_EQ(entity_->GetFileObject(nullptr), CitI::kInvalidArg);

  CitI::IInterface* view = entity_.Get();
  EXPECT_EQ(element->GetView(&view), CitI::kNotImpl);
  EXPECT_EQ(view, nullptr);
  testing::internal::CaptureStdout();
  EXPECT_FALSE(element->isValidInView());
  EXPECT_FALSE(element->isValidInView());
  EXPECT_EQ(testing::internal::GetCapturedStdout(),
            "Undefined Interface: Vad::CHdlElement::CHdlElement_IHdlElement::isValidInView"
            "Undefined Interface: Vad::CHdlElement::CHdlElement_IHdlElement::isValidInView");
}

TEST_F(Element, LibraryNameComesFromTheSourceFilesLibrary) {
  const std::string noMember =
      "Error - CHdlElement::GetLibraryName(): Unable to get the ISourceLibraryMember interface.\n";
  Port::StringBase name = "stale";
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetLibraryName(&name), CitI::kFail); }), noMember);
  EXPECT_EQ(name, "");
  Owned<Vad::Library> foreign(new Vad::Library("work", nullptr));  // no source file
  entity_->SetFile(foreign.Get());
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetLibraryName(&name), CitI::kFail); }), noMember);

  entity_->SetFile(file_.Get());
  EXPECT_EQ(entity_->GetLibraryName(&name), CitI::kOk);
  EXPECT_EQ(name, "work") << "a file in no library";
  SetLibrary(file_.Get(), "cells");
  EXPECT_EQ(entity_->GetLibraryName(&name), CitI::kOk);
  EXPECT_EQ(name, "cells");

  Owned<NamelessLibrary> nameless(new NamelessLibrary);
  QueryAs<Vad::ISourceLibraryMember>(file_.Get())->setSourceLibrary(nameless.Get());
  EXPECT_EQ(
      DebugTextOf([&] { EXPECT_EQ(entity_->GetLibraryName(&name), CitI::kFail); }),
      "Error - CHdlElement::GetLibraryName(): Unable to get the IName interface from the ISourceLibrary "
      "component.\n");
  EXPECT_EQ(name, "");
  EXPECT_EQ(entity_->GetLibraryName(nullptr), CitI::kInvalidArg);
}

TEST(CHdlElement, SameDesignUnitNeedsTheSameKindBeforeLookingAnyFurther) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::EntityDecl> twin(new Vad::EntityDecl("counter", nullptr));
  Port_DebugCapture debug;
  EXPECT_FALSE(entity->IsSameDesignUnit(architecture.Get()));
  EXPECT_FALSE(entity->IsSameDesignUnit(nullptr));
  twin->SetDesignUnitTypeId(Port::XUID(1, 2));
  EXPECT_FALSE(entity->IsSameDesignUnit(twin.Get()));
  EXPECT_EQ(debug.text(), "") << "neither source file was asked for its library";
  twin->SetDesignUnitTypeId(entity->GetDesignUnitTypeId());
  EXPECT_FALSE(entity->IsSameDesignUnit(twin.Get())) << "units without source files are never the same";
}

TEST(CHdlElement, ClientDataIsHeldWithOneReferenceAndReleasedWithTheElement) {
  Owned<Vad::Library> data(new Vad::Library("data", nullptr));
  Owned<Vad::Library> other(new Vad::Library("other", nullptr));
  CountingReceiver receiver;
  {
    Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
    auto* clientData = QueryAs<Vad::IHdlClientData>(entity.Get());
    EXPECT_EQ(clientData->GetClientData(nullptr), CitI::kInvalidArg);
    Owned<CitI::IInterface> held;
    EXPECT_EQ(clientData->GetClientData(held.Out()), CitI::kOk);
    EXPECT_EQ(held.Get(), nullptr);

    EXPECT_EQ(clientData->SetClientData(data.Get()), CitI::kOk);
    EXPECT_EQ(clientData->SetClientData(data.Get()), CitI::kOk);
    EXPECT_EQ(Prjrep::RefCountOf(data.Get()), 2u);
    EXPECT_EQ(clientData->GetClientData(held.Out()), CitI::kOk);
    EXPECT_EQ(held.Get(), data.Get());
    EXPECT_EQ(Prjrep::RefCountOf(data.Get()), 3u);
    held.Reset();
    EXPECT_EQ(clientData->SetClientData(other.Get()), CitI::kOk);
    EXPECT_EQ(Prjrep::RefCountOf(data.Get()), 1u);
    EXPECT_EQ(Prjrep::RefCountOf(other.Get()), 2u);

    // The event sender and the timestamp live and die with the element too.
    EXPECT_EQ(QueryAs<Prjrep::IEventSender>(entity.Get())->AddReceiver(&receiver), CitI::kOk);
    EXPECT_EQ(receiver.attaches, 1);
    std::int64_t seconds = 0, microseconds = 0;
    EXPECT_EQ(QueryAs<Prjrep::ITimestamp>(entity.Get())->GetTime(&seconds, &microseconds), CitI::kOk);
    EXPECT_GT(seconds, 1600000000) << "taken at construction";
  }
  EXPECT_EQ(Prjrep::RefCountOf(other.Get()), 1u);
  EXPECT_EQ(receiver.detaches, 1);
}

TEST_F(Element, DesignUnitFaceKeepsHostTextAndHandsOutTheBindingSet) {
  auto* designUnit = QueryAs<Vad::IDesignUnit>(entity_.Get());
  EXPECT_EQ(designUnit->SetHostText("note"), CitI::kOk);
  Port::StringBase text;
  EXPECT_EQ(designUnit->GetHostText(&text), CitI::kOk);
  EXPECT_EQ(text, "note");
  EXPECT_EQ(designUnit->GetHostText(nullptr), CitI::kInvalidArg);
  CitI::IInterface* view = entity_.Get();
  EXPECT_EQ(designUnit->GetDesignUnitView(&view), CitI::kNotImpl);
  EXPECT_EQ(view, nullptr);

  EXPECT_EQ(
      DebugTextOf([&] { EXPECT_EQ(designUnit->GetOutboundTransformBindings(nullptr), CitI::kNullOut); }),
      "ERROR: DesignUnit::GetOutboundTransformBindings - Invalid Parameter.\n");
  Owned<Vad::ITransformBindingInstanceSet> bindings;
  EXPECT_EQ(designUnit->GetOutboundTransformBindings(bindings.Out()), CitI::kOk);
  ASSERT_TRUE(bindings);
  EXPECT_EQ(bindings->GetCount(), 0u);
  EXPECT_EQ(bindings->QueryInterface(CitI::IInterface::Iid()), entity_.Get());
  EXPECT_EQ(Prjrep::RefCountOf(entity_.Get()), 2u) << "the set's reference is the element's";

  EXPECT_EQ(designUnit->GetReferencedTransformBindings(nullptr), CitI::kNullOut);
  Vad::ITransformBindingInstanceSet* referenced = bindings.Get();
  EXPECT_EQ(designUnit->GetReferencedTransformBindings(&referenced), CitI::kFail);
  EXPECT_EQ(referenced, nullptr);
  entity_->SetFile(file_.Get());
  referenced = bindings.Get();
  EXPECT_EQ(designUnit->GetReferencedTransformBindings(&referenced), CitI::kFail) << "no file component";
  EXPECT_EQ(referenced, nullptr);

  // Ports: none without parse results, and a stale out-parameter is cleared.
  EXPECT_EQ(entity_->GetPorts(nullptr), CitI::kInvalidArg);
  auto* ports = reinterpret_cast<Vad::IHdlPortIterator*>(entity_.Get());
  EXPECT_EQ(entity_->GetPorts(&ports), CitI::kOk);
  EXPECT_EQ(ports, nullptr);
}

TEST_F(Element, FileTypeNeedsASourceFileOfTheModule) {
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetFileType(nullptr), CitI::kNullOut); }),
            "ERROR: CHdlElement::GetFileType - Invalid Parameter.\n");
  Owned<Vad::Library> foreign(new Vad::Library("work", nullptr));
  entity_->SetFile(foreign.Get());
  Vad::IFileType* fileType = nullptr;
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetFileType(&fileType), CitI::kFail); }),
            "ERROR: CHdlElement::GetFileType - Unable to get the class pointer to CHdlFile.\n");
  EXPECT_EQ(fileType, nullptr);
  entity_->SetFile(file_.Get());
  Owned<Vad::IFileType> found;
  EXPECT_EQ(entity_->GetFileType(found.Out()), CitI::kOk);
  EXPECT_EQ(found.Get(), FileObject(file_.Get())->GetFileType().Get());
}

TEST_F(HostServices, DataStoreComesFromTheBaseServicesAndItsFailuresAreReported) {
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetDataStore(nullptr), CitI::kInvalidArg); }),
            "ERROR: CHdlElement::GetDataStore - Invalid Parameter.\n");
  Owned<Vad::IDataStore> store, again;
  EXPECT_EQ(entity_->GetDataStore(store.Out()), CitI::kOk);
  ASSERT_TRUE(store);
  EXPECT_EQ(store->SetValue("key", "value"), CitI::kOk);
  EXPECT_EQ(entity_->GetDataStore(again.Out()), CitI::kOk);
  EXPECT_EQ(again.Get(), store.Get()) << "the one process-wide store";

  Vad::IDataStore* missing = store.Get();
  RavA::Factory::UnregisterFactory(Vad::ClassIds::HostBaseServices());
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetDataStore(&missing), CitI::kFail); }),
            "ERROR: CHdlElement::GetDataStore - Failed BaseServices Factory create.\n");
  EXPECT_EQ(missing, nullptr);
  Owned<CitI::IInterface> factory(new Port::TFactory<RefusingBaseServices, &Vad::ClassIds::HostBaseServices>);
  RavA::Factory::RegisterFactory(Vad::ClassIds::HostBaseServices(), QueryAs<CitI::IFactory>(factory.Get()));
  missing = store.Get();
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetDataStore(&missing), CitI::kFail); }),
            "ERROR: CHdlElement::GetDataStore - Failed getting IDataStore from BaseServices.\n");
  EXPECT_EQ(missing, nullptr);
}

TEST_F(HostServices, DesignUnitTypeNeedsTheTypeStoreAndTheFileType) {
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetDesignUnitType(nullptr), CitI::kInvalidArg); }),
            "ERROR: CHdlElement::GetDesignUnitType - Invalid Parameter.\n");
  Vad::IDesignUnitType* type = nullptr;
  EXPECT_EQ(DebugTextOf([&] {
              EXPECT_EQ(QueryAs<Vad::IDesignUnit>(entity_.Get())->GetDesignUnitType(&type), CitI::kFail);
            }),
            "ERROR: CHdlElement::GetFileType - Unable to get the class pointer to CHdlFile.\n"
            "ERROR: CHdlElement::GetDesignUnitType - Unable to obtain the IFileType inteface .\n");
  EXPECT_EQ(type, nullptr);
  RavA::Factory::UnregisterFactory(Vad::ClassIds::HostBaseServices());
  EXPECT_EQ(DebugTextOf([&] { EXPECT_EQ(entity_->GetDesignUnitType(&type), CitI::kFail); }),
            "ERROR: CHdlElement::GetDataStore - Failed BaseServices Factory create.\n"
            "ERROR: CHdlElement::GetDesignUnitType - Unable to obtain the IDesignUnitTypeStore inteface .\n");
}

}  // namespace
