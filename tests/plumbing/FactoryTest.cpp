#include <gtest/gtest.h>

#include "PlumbingFixtures.h"
#include "Prjrep/AutoPtr.h"
#include "TFactory.h"

using namespace plumbing_test;

namespace {

QUILLON_XUID_FROM_TEXT(TestThingClass, "{5C1A7B2E-0F44-4E0B-8F6D-2B9E3A71C4D5}")
QUILLON_XUID_FROM_TEXT(OtherClass, "{5C1A7B2E-0F44-4E0B-8F6D-2B9E3A71C4D6}")

class DefaultThing final : public IThing {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IThing::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == Prjrep::IRefCount::Iid()) return &refs_;
    return nullptr;
  }
  int Value() override { return 42; }

 private:
  Prjrep::TRefCountHelper<> refs_{this};
};

using ThingFactory = Port::TFactory<DefaultThing, &TestThingClass>;

}  // namespace

TEST(Factory, CreatesOnlyItsOwnClassWithOneReference) {
  Prjrep::AutoRelease<CitI::IInterface> factory(new ThingFactory);
  auto* asFactory = Prjrep::QueryAs<CitI::IFactory>(factory.Get());
  ASSERT_NE(asFactory, nullptr);
  EXPECT_EQ(asFactory->CreateInstance(OtherClass()), nullptr);
  EXPECT_EQ(Port::LiveObjectCount(), 0);

  Prjrep::AutoRelease<CitI::IInterface> object(asFactory->CreateInstance(TestThingClass()));
  ASSERT_NE(object.Get(), nullptr);
  EXPECT_EQ(object->QueryInterface(CitI::IInterface::Iid()), object.Get());
  EXPECT_EQ(object->QueryInterface(CitI::IInterface::Iid()), object.Get());
  EXPECT_EQ(Prjrep::RefCountOf(object.Get()), 1u);
}

TEST(Factory, CountsThroughItsOwnFaceAndDestroysItselfAtZero) {
  auto* factory = new ThingFactory;
  auto* counter = static_cast<CommonI::IRefCount*>(factory->QueryInterface(CommonI::IRefCount::Iid()));
  ASSERT_NE(counter, nullptr);
  EXPECT_EQ(factory->QueryInterface(Prjrep::IRefCount::Iid()), nullptr);
  EXPECT_EQ(counter->QueryInterface(CitI::IFactory::Iid()), factory);
  std::uint32_t count = 0;
  EXPECT_EQ(counter->GetRefCount(&count), CitI::kOk);
  EXPECT_EQ(count, 1u);

  // The registry keeps its own reference; the creator's release leaves the factory alive.
  ASSERT_TRUE(RavA::Factory::RegisterFactory(TestThingClass(), factory));
  counter->Release();
  counter->GetRefCount(&count);
  EXPECT_EQ(count, 1u);
  Prjrep::AutoRelease<IThing> created;
  created = static_cast<IThing*>(RavA::Factory::CreateInstance(TestThingClass()));
  ASSERT_TRUE(created);
  EXPECT_EQ(created->Value(), 42);
  EXPECT_TRUE(RavA::Factory::UnregisterFactory(TestThingClass()));  // last reference: deleted
  EXPECT_EQ(RavA::Factory::CreateInstance(TestThingClass()), nullptr);
}
