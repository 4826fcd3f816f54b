#include <gtest/gtest.h>

#include "IPersist.h"
#include "PlumbingFixtures.h"
#include "Port/FileArchive.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "Prjrep/TAssociativeSetHelper.h"
#include "Prjrep/TSequenceSetHelper.h"
#include "TFactory.h"

using namespace plumbing_test;
using Prjrep::AutoPtr;
using Prjrep::AutoRelease;

namespace {

QUILLON_XUID_FROM_TEXT(StoredThingClass, "{7A0E55C4-93B1-4E62-A0D8-1F6C2B9E4A70}")

// A thing that persists its value.
class StoredThing final : public IThing, public Prjrep::IPersist {
 public:
  explicit StoredThing(int value = 0) : value_(value) {}
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IThing::Iid() || id == CitI::IInterface::Iid()) return static_cast<IThing*>(this);
    if (id == Prjrep::IPersist::Iid()) return static_cast<Prjrep::IPersist*>(this);
    if (id == Prjrep::IRefCount::Iid()) return &refs_;
    return nullptr;
  }
  int Value() override { return value_; }
  CitI::Result Load(Prjrep::IArchive* archive) override { return archive->ReadInt(&value_); }
  CitI::Result Save(Prjrep::IArchive* archive) override { return archive->WriteInt(value_); }
  CitI::Result GetClassXUID(Port::XUID* id) override {
    *id = StoredThingClass();
    return CitI::kOk;
  }
  CitI::Result GetInstanceXUID(Port::XUID* id) override {
    *id = instance_;
    return CitI::kOk;
  }
  CitI::Result SetInstanceXUID(const Port::XUID& id) override {
    instance_ = id;
    return CitI::kOk;
  }
  CitI::Result SetOwner(CitI::IInterface*) override { return CitI::kOk; }
  CitI::Result GetOwner(CitI::IInterface** owner) override {
    if (owner) *owner = nullptr;
    return CitI::kFail;
  }

 private:
  std::int32_t value_;
  Port::XUID instance_ = Port::XUID::New();
  Prjrep::TRefCountHelper<StoredThing> refs_{this};
};

class SetPersistence : public testing::Test {
 protected:
  void SetUp() override {
    AutoRelease<CitI::IInterface> factory(new Port::TFactory<StoredThing, &StoredThingClass>);
    RavA::Factory::RegisterFactory(StoredThingClass(), Prjrep::QueryAs<CitI::IFactory>(factory.Get()));
  }
  void TearDown() override { RavA::Factory::UnregisterFactory(StoredThingClass()); }
};

}  // namespace

TEST_F(SetPersistence, SequenceAndAssociativeSetsRoundTripTheirElementsAsReferences) {
  std::string bytes;
  {
    AutoRelease<IThing> a(new StoredThing(1)), b(new StoredThing(2));
    auto sequence = Prjrep::TRefdSequenceSetHelper<IThingSet>::New();
    sequence->Add(b.Get());
    sequence->Add(a.Get());
    sequence->Add(b.Get());
    Prjrep::TAssociativeSetHelper<IThingSet> table;
    table.Insert("x", a.Get());
    table.Insert("y", b.Get());

    auto archive = Port::FileArchive::CreateInMemory();
    auto* sequenceHelper = static_cast<Prjrep::TSequenceSetHelper<IThingSet>*>(sequence.Get());
    // The sets refer to objects that are owned elsewhere; here the archive holds them first.
    ASSERT_EQ(sequenceHelper->Save(archive.Get()), CitI::kOk);
    ASSERT_EQ(table.Save(archive.Get()), CitI::kOk);
    ASSERT_EQ(archive->WriteObject(Prjrep::QueryAs<Prjrep::IPersist>(a.Get())), CitI::kOk);
    ASSERT_EQ(archive->WriteObject(Prjrep::QueryAs<Prjrep::IPersist>(b.Get())), CitI::kOk);
    auto* writer = Prjrep::ObjectCast<Port::FileArchive>(archive.Get());
    ASSERT_EQ(writer->Close(), CitI::kOk);
    bytes = writer->Bytes();
  }

  Port::StringBase error;
  auto archive = Port::FileArchive::OpenFromBytes(bytes, &error);
  ASSERT_TRUE(archive) << error.str();
  auto sequence = Prjrep::TRefdSequenceSetHelper<IThingSet>::New();
  auto* sequenceHelper = static_cast<Prjrep::TSequenceSetHelper<IThingSet>*>(sequence.Get());
  Prjrep::TAssociativeSetHelper<IThingSet> table;
  ASSERT_EQ(sequenceHelper->Load(archive.Get()), CitI::kOk);
  ASSERT_EQ(table.Load(archive.Get()), CitI::kOk);
  AutoRelease<CitI::IInterface> a, b;
  ASSERT_EQ(archive->ReadObject(a.Out()), CitI::kOk);
  ASSERT_EQ(archive->ReadObject(b.Out()), CitI::kOk);
  ASSERT_EQ(Prjrep::ObjectCast<Port::FileArchive>(archive.Get())->Close(), CitI::kOk);

  const auto& loaded = sequenceHelper->Elements();
  ASSERT_EQ(loaded.size(), 3u);
  EXPECT_EQ(loaded[0], loaded[2]);  // the same object twice, not two copies
  EXPECT_EQ(loaded[0]->Value(), 2);
  EXPECT_EQ(loaded[1]->Value(), 1);
  EXPECT_EQ(loaded[1], Prjrep::QueryAs<IThing>(a.Get()));
  ASSERT_NE(table.Find("y"), nullptr);
  EXPECT_EQ(table.Find("y"), loaded[0]);
  EXPECT_EQ(table.Find("x")->Value(), 1);
}
