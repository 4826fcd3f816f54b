#include <gtest/gtest.h>

#include "PlumbingFixtures.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/RefCounting.h"

using namespace plumbing_test;
using Prjrep::AutoCast;
using Prjrep::AutoOut;
using Prjrep::AutoPtr;
using Prjrep::AutoRelease;
using Prjrep::RefCountOf;

TEST(RefCountHelper, ReleaseToZeroDestroysOwnerAndQueriesReachOwner) {
  std::vector<int> destroyed;
  auto* thing = new Thing(7, &destroyed);
  auto* counter = Prjrep::QueryAs<Prjrep::IRefCount>(thing);
  ASSERT_NE(counter, nullptr);
  EXPECT_EQ(counter->QueryInterface(Prjrep::IRefCountV1::Iid()), counter);
  EXPECT_EQ(counter->QueryInterface(IThing::Iid()), thing);
  EXPECT_EQ(counter->GetRefCount(), 1u);
  EXPECT_EQ(counter->AddRef(), 1);
  EXPECT_EQ(counter->Release(), 1);
  EXPECT_TRUE(destroyed.empty());
  EXPECT_EQ(counter->Release(), 1);
  EXPECT_EQ(destroyed, std::vector<int>{7});
}

TEST(AutoPtr, AssignmentAddsBeforeReleasingAndIgnoresTheSamePointer) {
  std::vector<int> destroyed;
  AutoRelease<IThing> a(new Thing(1, &destroyed));
  {
    AutoPtr<IThing> p;
    p = a.Get();
    EXPECT_EQ(RefCountOf(a.Get()), 2u);
    p = a.Get();  // same object again: no change
    EXPECT_EQ(RefCountOf(a.Get()), 2u);
    p = p;  // self-assignment
    EXPECT_EQ(RefCountOf(a.Get()), 2u);
  }
  EXPECT_EQ(RefCountOf(a.Get()), 1u);

  // Replacing the only reference to an object destroys it only after the new one is held.
  AutoPtr<IThing> q;
  q.Attach(new Thing(2, &destroyed));
  q = a.Get();
  EXPECT_EQ(destroyed, std::vector<int>{2});
  EXPECT_EQ(q->Value(), 1);
  q = nullptr;
  EXPECT_EQ(RefCountOf(a.Get()), 1u);
}

TEST(AutoPtr, OutSlotReleasesWhatItHeldAndCopyToAddsAReference) {
  std::vector<int> destroyed;
  AutoPtr<IThing> p;
  p.Attach(new Thing(1, &destroyed));
  *p.Out() = new Thing(2, &destroyed);  // a callee's reference becomes p's
  EXPECT_EQ(destroyed, std::vector<int>{1});
  EXPECT_EQ(p->Value(), 2);

  IThing* copy = nullptr;
  EXPECT_EQ(p.CopyTo(&copy), CitI::kOk);
  EXPECT_EQ(RefCountOf(copy), 2u);
  AutoRelease<IThing> adopt(copy);
  EXPECT_EQ(p.CopyTo(nullptr), CitI::kInvalidArg);
}

TEST(AutoPtr, QueryIsExactOverAll128Bits) {
  AutoRelease<IThing> thing(new Thing(3));
  EXPECT_EQ(thing->QueryInterface(kNearThingId), nullptr);
  AutoCast<IThing> view(thing.Get());
  EXPECT_TRUE(view);
  EXPECT_EQ(RefCountOf(thing.Get()), 1u);  // a view takes no reference
  AutoCast<Prjrep::IEventReceiver> wrongKind(thing.Get());
  EXPECT_FALSE(wrongKind);
}

TEST(AutoOut, ClearsTheSlotAndWritesWithOneReference) {
  AutoRelease<IThing> thing(new Thing(4));
  IThing* slot = reinterpret_cast<IThing*>(0x1);
  {
    AutoOut<IThing> out(&slot);
    EXPECT_EQ(slot, nullptr);
    out.Set(thing.Get());
  }
  EXPECT_EQ(slot, thing.Get());
  EXPECT_EQ(RefCountOf(thing.Get()), 2u);
  AutoRelease<IThing> callerReference(slot);

  AutoOut<IThing> missing(nullptr);
  EXPECT_TRUE(missing.IsMissing());
  missing.Set(thing.Get());  // nowhere to write: no reference taken
  EXPECT_EQ(RefCountOf(thing.Get()), 2u);
}
