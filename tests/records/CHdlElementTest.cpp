#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "Arch.h"
#include "CHdlElement.h"
#include "CompInst.h"
#include "DatabaseFixtures.h"
#include "EntityDecl.h"
#include "HdlSets.h"
#include "Host/HostComponents.h"
#include "Host/SourceLibrary.h"
#include "IBaseServices.h"
#include "IEventSender.h"
#include "ITimestamp.h"
#include "Library.h"
#include "PackageDecl.h"
#include "Port/MsgManData.h"
#include "Prjrep/RefCounting.h"
#include "Prjrep/TSequenceSetHelper.h"
#include "TFactory.h"
#include "Use.h"
#include "module.h"

using namespace database_test;
using Prjrep::QueryAs;

namespace {

class CountingReceiver final : public Prjrep::IEventReceiver {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == IEventReceiver::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result OnEvent(CitI::IInterface*) override { return CitI::kOk; }
  CitI::Result OnAttach(Prjrep::IEventSender*) override {
    ++attaches;
    return CitI::kOk;
  }
  CitI::Result OnDetach(Prjrep::IEventSender*) override {
    ++detaches;
    return CitI::kOk;
  }
  int attaches = 0;
  int detaches = 0;
};

// Base services whose data-store request always fails.
class RefusingBaseServices final : public Vad::IBaseServices {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IBaseServices::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == Prjrep::IRefCount::Iid()) return &refs_;
    return nullptr;
  }
  CitI::Result GetService(const Port::XUID&, CitI::IInterface** out) override {
    *out = nullptr;
    return CitI::kFail;
  }

 private:
  Prjrep::TRefCountHelper<RefusingBaseServices> refs_{this};
};

std::string NameOf(CitI::IInterface* element) {
  Port::StringBase name = "stale";
  EXPECT_EQ(QueryAs<Prjrep::IName>(element)->GetName(&name), CitI::kOk);
  return name.str();
}

class HostServices : public testing::Test {
 protected:
  void SetUp() override { ASSERT_TRUE(Host::RegisterHostComponents()); }
  void TearDown() override { RavA::Factory::Clear(); }
};

}  // namespace

TEST(CHdlElement, AnswersItsFacesThroughEachOtherWithoutTakingReferences) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  const std::vector<Port::XUID> answered{
      Prjrep::IEventSender::Iid(), Vad::IHdlDesignUnit::Iid(),   Vad::IHdlGraphicsPosition::Iid(),
      Vad::IHdlClientData::Iid(),  Vad::IHdlTextPosition::Iid(), Prjrep::IName::Iid(),
      Vad::IHdlElement::Iid(),     Vad::IHdlDUProperties::Iid(), Vad::IInstanceData::Iid(),
      Prjrep::ITimestamp::Iid(),   Vad::IDesignUnit::Iid(),      Prjrep::IPersist::Iid(),
      Prjrep::IRefCount::Iid()};
  std::vector<CitI::IInterface*> faces;
  for (const Port::XUID& id : answered) {
    CitI::IInterface* face = entity->QueryInterface(id);
    ASSERT_NE(face, nullptr) << id.ToString();
    EXPECT_EQ(face->QueryInterface(CitI::IInterface::Iid()), entity.Get()) << id.ToString();
    EXPECT_EQ(face->QueryInterface(id), face) << id.ToString();
    faces.push_back(face);
  }
  std::sort(faces.begin(), faces.end());
  EXPECT_EQ(std::unique(faces.begin(), faces.end()), faces.end()) << "every interface has its own face";
  EXPECT_EQ(entity->QueryInterface(Vad::IHdlFile::Iid()), nullptr);
  EXPECT_EQ(entity->QueryInterface(Vad::ITransformBindingInstanceSet::Iid()), nullptr);
  EXPECT_EQ(entity->QueryInterface(Port::XUID(Vad::IHdlElement::Iid().High(), 0)), nullptr);
  EXPECT_EQ(Prjrep::RefCountOf(entity.Get()), 1u);
}

TEST(CHdlElement, PositionsTypeIdentifierAndInstanceFlagReachTheHostThroughTheirFaces) {
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::CompInst> instance(new Vad::CompInst("u1", "adder", architecture.Get()));
  const Port::XUID typeId("{6DCC6CCB-40B6-4f09-9AB3-C3593438F5B2}");
  instance->SetTextPosition(12, 3);
  instance->SetGraphicsPosition(40, 50);
  instance->SetDesignUnitTypeId(typeId);
  instance->SetInGenerate(true);

  std::uint32_t value = 0;
  auto* text = QueryAs<Vad::IHdlTextPosition>(instance.Get());
  EXPECT_EQ(text->GetLine(&value), CitI::kOk);
  EXPECT_EQ(value, 12u);
  EXPECT_EQ(text->GetColumn(&value), CitI::kOk);
  EXPECT_EQ(value, 3u);
  EXPECT_EQ(text->GetLine(nullptr), CitI::kInvalidArg);
  auto* graphics = QueryAs<Vad::IHdlGraphicsPosition>(instance.Get());
  EXPECT_EQ(graphics->GetX(&value), CitI::kOk);
  EXPECT_EQ(value, 40u);
  EXPECT_EQ(graphics->GetY(&value), CitI::kOk);
  EXPECT_EQ(value, 50u);
  Port::XUID reported;
  EXPECT_EQ(QueryAs<Vad::IHdlDesignUnit>(instance.Get())->GetDesignUnitTypeId(&reported), CitI::kOk);
  EXPECT_EQ(reported, typeId);
  bool inGenerate = false;
  EXPECT_EQ(QueryAs<Vad::IInstanceData>(instance.Get())->GetInGenerate(&inGenerate), CitI::kOk);
  EXPECT_TRUE(inGenerate);

  Vad::IHdlDesignUnit* self = nullptr;
  auto* designUnit = QueryAs<Vad::IHdlDesignUnit>(instance.Get());
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

  EXPECT_EQ(properties->SetProperty("PARTITION", "p1"), CitI::kOk);
  EXPECT_EQ(properties->SetProperty("PARTITION", "p2"), CitI::kOk);
  EXPECT_EQ(properties->SetProperty("ab", "2"), CitI::kOk);
  EXPECT_EQ(properties->SetProperty("a", "1"), CitI::kOk);
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

  bool flag = false;
  EXPECT_EQ(QueryAs<Vad::IHdlDesignUnit>(entity.Get())->GetUnitFlag(0, &flag), CitI::kOk);
  EXPECT_TRUE(flag);
  EXPECT_EQ(QueryAs<Vad::IHdlDesignUnit>(entity.Get())->GetUnitFlag(0, nullptr), CitI::kFail);
  flag = true;
  EXPECT_EQ(QueryAs<Vad::IHdlDesignUnit>(top.Get())->GetUnitFlag(0, &flag), CitI::kOk);
  EXPECT_FALSE(flag);

  flag = true;
  EXPECT_EQ(QueryAs<Vad::IHdlDesignUnit>(package.Get())->GetUnitFlag(0, &flag), 4);
  EXPECT_TRUE(flag) << "left alone";
  // Without a source file the architecture's entity cannot be looked up.
  EXPECT_EQ(QueryAs<Vad::IHdlDesignUnit>(architecture.Get())->GetUnitFlag(0, &flag), CitI::kFail);
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

TEST(CHdlElement, ElementFaceHandsOutItsFileAndProvidesNoView) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  auto* element = QueryAs<Vad::IHdlElement>(entity.Get());
  Vad::IHdlFile* file = nullptr;
  EXPECT_EQ(element->GetFile(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(element->GetFile(&file), CitI::kOk);
  EXPECT_EQ(file, nullptr);

  Owned<FakeSourceFile> source(new FakeSourceFile);
  entity->SetFile(source.Get());
  Owned<Vad::IHdlFile> held;
  EXPECT_EQ(element->GetSourceFile(held.Out()), CitI::kOk);
  EXPECT_EQ(held.Get(), source.Get());
  EXPECT_EQ(Prjrep::RefCountOf(source.Get()), 2u) << "the element keeps none, the caller one";
  Owned<CitI::IInterface> object;
  EXPECT_EQ(entity->GetFileObject(object.Out()), CitI::kOk);
  EXPECT_EQ(object.Get(), source.Get());
  EXPECT_EQ(entity->GetFileObject(nullptr), CitI::kInvalidArg);

  CitI::IInterface* view = entity.Get();
  EXPECT_EQ(element->GetView(&view), CitI::kNotImpl);
  EXPECT_EQ(view, nullptr);

  testing::internal::CaptureStdout();
  EXPECT_FALSE(element->isValidInView());
  EXPECT_FALSE(element->isValidInView());
  EXPECT_EQ(testing::internal::GetCapturedStdout(),
            "Undefined Interface: Vad::CHdlElement::CHdlElement_IHdlElement::isValidInView"
            "Undefined Interface: Vad::CHdlElement::CHdlElement_IHdlElement::isValidInView");
  entity->SetFile(nullptr);
}

TEST(CHdlElement, LibraryNameComesFromTheSourceFilesLibrary) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Port::StringBase name = "stale";
  {
    Port_DebugCapture debug;
    EXPECT_EQ(entity->GetLibraryName(&name), CitI::kFail);
    EXPECT_EQ(name, "");
    EXPECT_EQ(debug.text(),
              "Error - CHdlElement::GetLibraryName(): Unable to get the ISourceLibraryMember interface.\n");
  }
  Owned<FakeSourceFile> noMember(new FakeSourceFile(false));
  entity->SetFile(noMember.Get());
  {
    Port_DebugCapture debug;
    EXPECT_EQ(entity->GetLibraryName(&name), CitI::kFail);
    EXPECT_EQ(debug.text(),
              "Error - CHdlElement::GetLibraryName(): Unable to get the ISourceLibraryMember interface.\n");
  }
  Owned<FakeSourceFile> source(new FakeSourceFile);
  entity->SetFile(source.Get());
  auto* member = QueryAs<Vad::ISourceLibraryMember>(source.Get());
  EXPECT_EQ(entity->GetLibraryName(&name), CitI::kOk);
  EXPECT_EQ(name, "work") << "a file in no library";

  member->setSourceLibrary(Host::SourceLibrary::Create("cells").Get());
  EXPECT_EQ(entity->GetLibraryName(&name), CitI::kOk);
  EXPECT_EQ(name, "cells");

  Owned<NamelessLibrary> nameless(new NamelessLibrary);
  member->setSourceLibrary(nameless.Get());
  {
    Port_DebugCapture debug;
    EXPECT_EQ(entity->GetLibraryName(&name), CitI::kFail);
    EXPECT_EQ(name, "");
    EXPECT_EQ(
        debug.text(),
        "Error - CHdlElement::GetLibraryName(): Unable to get the IName interface from the ISourceLibrary "
        "component.\n");
  }
  member->setSourceLibrary(nullptr);
  EXPECT_EQ(entity->GetLibraryName(nullptr), CitI::kInvalidArg);
}

TEST(CHdlElement, SameDesignUnitNeedsTheSameKindBeforeLookingAnyFurther) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Owned<Vad::Arch> architecture(new Vad::Arch("counter", "rtl", nullptr));
  Owned<Vad::EntityDecl> twin(new Vad::EntityDecl("counter", nullptr));
  Port_DebugCapture debug;
  EXPECT_FALSE(entity->IsSameDesignUnit(architecture.Get()));
  EXPECT_FALSE(entity->IsSameDesignUnit(nullptr));
  EXPECT_EQ(debug.text(), "") << "neither source file was asked for its library";

  twin->SetDesignUnitTypeId(Port::XUID(1, 2));
  EXPECT_FALSE(entity->IsSameDesignUnit(twin.Get()));
  EXPECT_EQ(debug.text(), "");
  twin->SetDesignUnitTypeId(entity->GetDesignUnitTypeId());
  EXPECT_FALSE(entity->IsSameDesignUnit(twin.Get())) << "units without source files are never the same";
}

TEST(CHdlElement, ClientDataIsHeldWithOneReferenceAndReleasedWithTheElement) {
  Owned<Vad::Library> data(new Vad::Library("data", nullptr));
  Owned<Vad::Library> other(new Vad::Library("other", nullptr));
  {
    Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
    auto* clientData = QueryAs<Vad::IHdlClientData>(entity.Get());
    EXPECT_EQ(clientData->GetClientData(nullptr), CitI::kInvalidArg);
    Owned<CitI::IInterface> held;
    EXPECT_EQ(clientData->GetClientData(held.Out()), CitI::kOk);
    EXPECT_EQ(held.Get(), nullptr);

    EXPECT_EQ(clientData->SetClientData(data.Get()), CitI::kOk);
    EXPECT_EQ(Prjrep::RefCountOf(data.Get()), 2u);
    EXPECT_EQ(clientData->SetClientData(data.Get()), CitI::kOk);
    EXPECT_EQ(Prjrep::RefCountOf(data.Get()), 2u);
    EXPECT_EQ(clientData->GetClientData(held.Out()), CitI::kOk);
    EXPECT_EQ(held.Get(), data.Get());
    EXPECT_EQ(Prjrep::RefCountOf(data.Get()), 3u);
    held.Reset();

    EXPECT_EQ(clientData->SetClientData(other.Get()), CitI::kOk);
    EXPECT_EQ(Prjrep::RefCountOf(data.Get()), 1u);
    EXPECT_EQ(Prjrep::RefCountOf(other.Get()), 2u);
  }
  EXPECT_EQ(Prjrep::RefCountOf(other.Get()), 1u);
}

TEST(CHdlElement, EventSenderAndTimestampLiveAndDieWithTheElement) {
  CountingReceiver receiver;
  {
    Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
    auto* sender = QueryAs<Prjrep::IEventSender>(entity.Get());
    EXPECT_EQ(sender->AddReceiver(&receiver), CitI::kOk);
    EXPECT_EQ(receiver.attaches, 1);

    std::int64_t seconds = 0;
    std::int64_t microseconds = 0;
    auto* timestamp = QueryAs<Prjrep::ITimestamp>(entity.Get());
    EXPECT_EQ(timestamp->GetTime(&seconds, &microseconds), CitI::kOk);
    EXPECT_GT(seconds, 1600000000) << "taken at construction";
  }
  EXPECT_EQ(receiver.detaches, 1);
}

TEST(CHdlElement, DesignUnitFaceKeepsHostTextAndHandsOutTheBindingSet) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  auto* designUnit = QueryAs<Vad::IDesignUnit>(entity.Get());
  EXPECT_EQ(designUnit->SetHostText("note"), CitI::kOk);
  Port::StringBase text;
  EXPECT_EQ(designUnit->GetHostText(&text), CitI::kOk);
  EXPECT_EQ(text, "note");
  EXPECT_EQ(designUnit->GetHostText(nullptr), CitI::kInvalidArg);

  CitI::IInterface* view = entity.Get();
  EXPECT_EQ(designUnit->GetDesignUnitView(&view), CitI::kNotImpl);
  EXPECT_EQ(view, nullptr);

  {
    Port_DebugCapture debug;
    EXPECT_EQ(designUnit->GetOutboundTransformBindings(nullptr), CitI::kNullOut);
    EXPECT_EQ(debug.text(), "ERROR: DesignUnit::GetOutboundTransformBindings - Invalid Parameter.\n");
  }
  Owned<Vad::ITransformBindingInstanceSet> bindings;
  EXPECT_EQ(designUnit->GetOutboundTransformBindings(bindings.Out()), CitI::kOk);
  ASSERT_TRUE(bindings);
  EXPECT_EQ(bindings->GetCount(), 0u);
  EXPECT_EQ(bindings->QueryInterface(CitI::IInterface::Iid()), entity.Get());
  EXPECT_EQ(Prjrep::RefCountOf(entity.Get()), 2u) << "the set's reference is the element's";

  EXPECT_EQ(designUnit->GetReferencedTransformBindings(nullptr), CitI::kNullOut);
  Vad::ITransformBindingInstanceSet* referenced = bindings.Get();
  EXPECT_EQ(designUnit->GetReferencedTransformBindings(&referenced), CitI::kFail);
  EXPECT_EQ(referenced, nullptr);
  Owned<FakeSourceFile> source(new FakeSourceFile);
  entity->SetFile(source.Get());
  EXPECT_EQ(designUnit->GetReferencedTransformBindings(&referenced), CitI::kFail) << "no file component";
  EXPECT_EQ(referenced, nullptr);
  entity->SetFile(nullptr);
}

TEST(CHdlElement, PortsOfAUnitWithoutParseResultsAreEmpty) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  EXPECT_EQ(entity->GetPorts(nullptr), CitI::kInvalidArg);
  // Any stale value in the out-parameter must be cleared.
  auto* ports = reinterpret_cast<Vad::IHdlPortIterator*>(entity.Get());
  EXPECT_EQ(entity->GetPorts(&ports), CitI::kOk);
  EXPECT_EQ(ports, nullptr);
}

TEST_F(HostServices, DataStoreComesFromTheBaseServices) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  {
    Port_DebugCapture debug;
    EXPECT_EQ(entity->GetDataStore(nullptr), CitI::kInvalidArg);
    EXPECT_EQ(debug.text(), "ERROR: CHdlElement::GetDataStore - Invalid Parameter.\n");
  }
  Owned<Vad::IDataStore> store;
  EXPECT_EQ(entity->GetDataStore(store.Out()), CitI::kOk);
  ASSERT_TRUE(store);
  EXPECT_EQ(store->SetValue("key", "value"), CitI::kOk);
  Owned<Vad::IDataStore> again;
  EXPECT_EQ(entity->GetDataStore(again.Out()), CitI::kOk);
  EXPECT_EQ(again.Get(), store.Get()) << "the one process-wide store";
}

TEST_F(HostServices, DataStoreFailuresAreReported) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Vad::IDataStore* store = nullptr;
  RavA::Factory::UnregisterFactory(Vad::ClassIds::HostBaseServices());
  {
    Port_DebugCapture debug;
    EXPECT_EQ(entity->GetDataStore(&store), CitI::kFail);
    EXPECT_EQ(store, nullptr);
    EXPECT_EQ(debug.text(), "ERROR: CHdlElement::GetDataStore - Failed BaseServices Factory create.\n");
  }
  Owned<CitI::IInterface> factory(new Port::TFactory<RefusingBaseServices, &Vad::ClassIds::HostBaseServices>);
  RavA::Factory::RegisterFactory(Vad::ClassIds::HostBaseServices(), QueryAs<CitI::IFactory>(factory.Get()));
  Port_DebugCapture debug;
  EXPECT_EQ(entity->GetDataStore(&store), CitI::kFail);
  EXPECT_EQ(store, nullptr);
  EXPECT_EQ(debug.text(),
            "ERROR: CHdlElement::GetDataStore - Failed getting IDataStore from BaseServices.\n");
}

TEST_F(HostServices, DesignUnitTypeNeedsTheTypeStoreAndTheFileType) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  {
    Port_DebugCapture debug;
    EXPECT_EQ(entity->GetDesignUnitType(nullptr), CitI::kInvalidArg);
    EXPECT_EQ(debug.text(), "ERROR: CHdlElement::GetDesignUnitType - Invalid Parameter.\n");
  }
  Vad::IDesignUnitType* type = nullptr;
  {
    Port_DebugCapture debug;
    EXPECT_EQ(QueryAs<Vad::IDesignUnit>(entity.Get())->GetDesignUnitType(&type), CitI::kFail);
    EXPECT_EQ(type, nullptr);
    EXPECT_EQ(debug.text(),
              "ERROR: CHdlElement::GetFileType - Unable to get the class pointer to CHdlFile.\n"
              "ERROR: CHdlElement::GetDesignUnitType - Unable to obtain the IFileType inteface .\n");
  }
  RavA::Factory::UnregisterFactory(Vad::ClassIds::HostBaseServices());
  Port_DebugCapture debug;
  EXPECT_EQ(entity->GetDesignUnitType(&type), CitI::kFail);
  EXPECT_EQ(debug.text(),
            "ERROR: CHdlElement::GetDataStore - Failed BaseServices Factory create.\n"
            "ERROR: CHdlElement::GetDesignUnitType - Unable to obtain the IDesignUnitTypeStore inteface .\n");
}

TEST(CHdlElement, FileTypeNeedsASourceFile) {
  Owned<Vad::EntityDecl> entity(new Vad::EntityDecl("counter", nullptr));
  Port_DebugCapture debug;
  EXPECT_EQ(entity->GetFileType(nullptr), CitI::kNullOut);
  EXPECT_EQ(debug.text(), "ERROR: CHdlElement::GetFileType - Invalid Parameter.\n");
  debug.clear();
  Owned<FakeSourceFile> foreign(new FakeSourceFile);
  entity->SetFile(foreign.Get());
  Vad::IFileType* fileType = nullptr;
  EXPECT_EQ(entity->GetFileType(&fileType), CitI::kFail);
  EXPECT_EQ(fileType, nullptr);
  EXPECT_EQ(debug.text(), "ERROR: CHdlElement::GetFileType - Unable to get the class pointer to CHdlFile.\n");
  entity->SetFile(nullptr);
}
