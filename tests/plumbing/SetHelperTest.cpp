#include <gtest/gtest.h>

#include "PlumbingFixtures.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TAssociativeSetHelper.h"
#include "Prjrep/TListIter.h"
#include "Prjrep/TSequenceSetHelper.h"

using namespace plumbing_test;
using Prjrep::AutoPtr;
using Prjrep::AutoRelease;
using Prjrep::RefCountOf;

namespace {

// An owner embedding both kinds of set, as a project does.
class Owner final : public CitI::IInterface {
 public:
  Owner() {
    sequence.SetOwner(this);
    table.SetOwner(this);
  }
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == CitI::IInterface::Iid()) return this;
    if (id == Prjrep::IRefCount::Iid() || id == Prjrep::IRefCountV1::Iid()) return &refs;
    return nullptr;
  }
  Prjrep::TSequenceSetHelper<IThingSet> sequence;
  Prjrep::TAssociativeSetHelper<IThingSet> table;
  Prjrep::TRefCountHelper<> refs{this};
};

std::vector<int> Values(IThingSet* set) {
  std::vector<int> values;
  AutoRelease<IThingIterator> it;
  EXPECT_EQ(set->CreateIterator(it.Out()), CitI::kOk);
  for (; !it->IsDone(); it->Next()) values.push_back(it->Current()->Value());
  return values;
}

}  // namespace

TEST(SetHelper, EmbeddedSetCountsOnItsOwnerAndStandAloneSetOnItself) {
  AutoRelease<CitI::IInterface> owner(new Owner);
  auto* impl = static_cast<Owner*>(owner.Get());
  EXPECT_EQ(impl->sequence.QueryInterface(IThingSet::Iid()), &impl->sequence);
  EXPECT_EQ(impl->sequence.QueryInterface(Prjrep::IRefCount::Iid()), &impl->refs);
  EXPECT_EQ(impl->sequence.QueryInterface(CitI::IInterface::Iid()), owner.Get());

  {
    // An iterator over an embedded set keeps the owner alive.
    AutoRelease<IThingIterator> it;
    ASSERT_EQ(impl->sequence.CreateIterator(it.Out()), CitI::kOk);
    EXPECT_EQ(RefCountOf(owner.Get()), 2u);
    EXPECT_EQ(RefCountOf(it.Get()), 1u);
  }
  EXPECT_EQ(RefCountOf(owner.Get()), 1u);

  auto standAlone = Prjrep::TRefdSequenceSetHelper<IThingSet>::New();
  auto* counter = standAlone->QueryInterface(Prjrep::IRefCount::Iid());
  ASSERT_NE(counter, nullptr);
  EXPECT_NE(counter, static_cast<CitI::IInterface*>(standAlone.Get()));
  EXPECT_EQ(standAlone->QueryInterface(CitI::IInterface::Iid()), standAlone.Get());
  EXPECT_EQ(RefCountOf(standAlone.Get()), 1u);
}

TEST(SetHelper, IteratorStopsAtTheEndAndFirstRestarts) {
  auto set = Prjrep::TRefdSequenceSetHelper<IThingSet>::New();
  AutoRelease<IThing> a(new Thing(1)), b(new Thing(2));
  EXPECT_EQ(set->Add(a.Get()), CitI::kOk);
  EXPECT_EQ(set->Add(b.Get()), CitI::kOk);
  EXPECT_EQ(set->Add(a.Get()), CitI::kOk);  // duplicates allowed
  EXPECT_EQ(set->Add(nullptr), CitI::kFail);
  EXPECT_EQ(RefCountOf(a.Get()), 3u);
  EXPECT_EQ(Values(set.Get()), (std::vector<int>{1, 2, 1}));

  AutoRelease<IThingIterator> it;
  ASSERT_EQ(set->CreateIterator(it.Out()), CitI::kOk);
  while (!it->IsDone()) EXPECT_EQ(it->Next(), CitI::kOk);
  EXPECT_EQ(it->Next(), CitI::kFail);
  EXPECT_TRUE(it->IsDone());
  EXPECT_EQ(it->Current(), nullptr);
  EXPECT_EQ(it->First(), CitI::kOk);
  EXPECT_EQ(it->Current(), a.Get());
  EXPECT_EQ(set->CreateIterator(nullptr), CitI::kInvalidArg);
}

TEST(SetHelper, RemoveThroughIteratorReleasesAndAdvances) {
  std::vector<int> destroyed;
  auto set = Prjrep::TRefdSequenceSetHelper<IThingSet>::New();
  for (int v : {1, 2, 3}) {
    AutoRelease<IThing> thing(new Thing(v, &destroyed));
    set->Add(thing.Get());
  }
  AutoRelease<IThingIterator> it;
  set->CreateIterator(it.Out());
  it->Next();
  EXPECT_EQ(set->Remove(it.Get()), CitI::kOk);
  EXPECT_EQ(destroyed, std::vector<int>{2});
  EXPECT_EQ(it->Current()->Value(), 3);
  EXPECT_EQ(Values(set.Get()), (std::vector<int>{1, 3}));
  it->Next();
  EXPECT_EQ(set->Remove(it.Get()), CitI::kFail);  // finished iterator
  EXPECT_EQ(set->Remove(nullptr), CitI::kFail);

  // An iterator of another set is refused.
  auto other = Prjrep::TRefdSequenceSetHelper<IThingSet>::New();
  AutoRelease<IThingIterator> foreign;
  other->CreateIterator(foreign.Out());
  EXPECT_EQ(set->Remove(foreign.Get()), CitI::kFail);
  EXPECT_EQ(set->Clear(), CitI::kOk);
  EXPECT_EQ(set->GetCount(), 0u);
  EXPECT_EQ(destroyed, (std::vector<int>{2, 1, 3}));
}

TEST(SetHelper, AssociativeInsertReplacesAndAddIsRefused) {
  std::vector<int> destroyed;
  AutoRelease<CitI::IInterface> owner(new Owner);
  auto& table = static_cast<Owner*>(owner.Get())->table;
  AutoRelease<IThing> first(new Thing(1, &destroyed)), second(new Thing(2, &destroyed));
  AutoRelease<IThing> other(new Thing(3, &destroyed));

  EXPECT_EQ(table.Add(first.Get()), CitI::kNotImpl);
  EXPECT_EQ(table.GetCount(), 0u);
  EXPECT_EQ(RefCountOf(first.Get()), 1u);

  table.Insert("b", first.Get());
  table.Insert("a", other.Get());
  table.Insert("b", second.Get());
  EXPECT_EQ(table.GetCount(), 2u);
  EXPECT_EQ(RefCountOf(first.Get()), 1u);  // released once by the replacement
  EXPECT_EQ(RefCountOf(second.Get()), 2u);
  EXPECT_EQ(Values(&table), (std::vector<int>{3, 2}));  // key order

  // Removing through an iterator moves it to the next key.
  AutoRelease<IThingIterator> it;
  table.CreateIterator(it.Out());
  EXPECT_EQ(table.Remove(it.Get()), CitI::kOk);
  EXPECT_EQ(it->Current(), second.Get());
  EXPECT_EQ(table.Find("a"), nullptr);

  // An iterator whose key was erased behind its back moves on to the next key.
  table.Insert("c", other.Get());
  EXPECT_TRUE(table.Erase("b"));
  EXPECT_EQ(it->Current(), other.Get());
  EXPECT_TRUE(destroyed.empty());
}

namespace {
class IListIterator : public Prjrep::IIteratorOf<IThing> {
 public:
  QUILLON_INTERFACE_ID("{0D0A1C6E-3F0B-4B8E-9E54-6A1F7E2B9C04}")
};
}  // namespace

TEST(ListIter, NextPastTheEndStillAnswersOneAndEntriesAreHeld) {
  std::vector<int> destroyed;
  AutoRelease<IThing> a(new Thing(1, &destroyed)), b(new Thing(2, &destroyed));
  auto it = Prjrep::TInterfaceListIter<IListIterator>::New({a.Get(), b.Get()});
  EXPECT_EQ(RefCountOf(a.Get()), 2u);
  EXPECT_EQ(it->Current(), a.Get());
  it->Next();
  it->Next();
  EXPECT_TRUE(it->IsDone());
  EXPECT_EQ(it->Next(), CitI::kOk);
  EXPECT_TRUE(it->IsDone());
  EXPECT_EQ(it->Current(), nullptr);
  it->First();
  EXPECT_EQ(it->Current(), a.Get());
  it.Reset();
  EXPECT_EQ(RefCountOf(a.Get()), 1u);
}
