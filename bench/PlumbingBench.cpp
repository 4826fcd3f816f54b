// Costs of the plumbing that every project operation pays: identifiers, sets and iterators.
#include <benchmark/benchmark.h>

#include <random>
#include <string>
#include <vector>

#include "Prjrep/AutoPtr.h"
#include "Prjrep/TAssociativeSetHelper.h"
#include "Prjrep/TSequenceSetHelper.h"

namespace {

class IItem : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{6E3B2A90-1C4D-4F7E-8A15-3D9C0B7E5F21}")
};
class IItemIterator : public Prjrep::IIteratorOf<IItem> {
 public:
  QUILLON_INTERFACE_ID("{6E3B2A90-1C4D-4F7E-8A15-3D9C0B7E5F22}")
};
class IItemSet : public Prjrep::ISetOf<IItem, IItemIterator> {
 public:
  QUILLON_INTERFACE_ID("{6E3B2A90-1C4D-4F7E-8A15-3D9C0B7E5F23}")
};

class Item final : public IItem {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IItem::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == Prjrep::IRefCount::Iid()) return &refs_;
    return nullptr;
  }

 private:
  Prjrep::TRefCountHelper<> refs_{this};
};

std::vector<Prjrep::AutoRelease<IItem>> MakeItems(std::size_t count) {
  std::vector<Prjrep::AutoRelease<IItem>> items(count);
  for (auto& item : items) item = new Item;
  return items;
}

void BM_XuidFromText(benchmark::State& state) {
  for (auto _ : state) benchmark::DoNotOptimize(Port::XUID("{10977847-7D8D-46e9-AC19-7B0EED3C4657}"));
}
BENCHMARK(BM_XuidFromText);

void BM_SequenceSetFillAndIterate(benchmark::State& state) {
  auto items = MakeItems(static_cast<std::size_t>(state.range(0)));
  for (auto _ : state) {
    auto set = Prjrep::TRefdSequenceSetHelper<IItemSet>::New();
    for (auto& item : items) set->Add(item.Get());
    Prjrep::AutoRelease<IItemIterator> it;
    set->CreateIterator(it.Out());
    std::size_t seen = 0;
    for (; !it->IsDone(); it->Next()) seen += it->Current() != nullptr;
    benchmark::DoNotOptimize(seen);
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(BM_SequenceSetFillAndIterate)->Arg(10'000);

void BM_AssociativeSetInsertAndIterate(benchmark::State& state) {
  auto items = MakeItems(static_cast<std::size_t>(state.range(0)));
  std::vector<Port::StringBase> keys;
  std::mt19937 random(7);
  for (std::size_t i = 0; i < items.size(); ++i)
    keys.emplace_back("/project/src/unit_" + std::to_string(random()) + ".vhd");
  for (auto _ : state) {
    Prjrep::TAssociativeSetHelper<IItemSet> table;
    for (std::size_t i = 0; i < items.size(); ++i) table.Insert(keys[i], items[i].Get());
    Prjrep::AutoRelease<IItemIterator> it;
    table.CreateIterator(it.Out());
    std::size_t seen = 0;
    for (; !it->IsDone(); it->Next()) seen += it->Current() != nullptr;
    benchmark::DoNotOptimize(seen);
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(BM_AssociativeSetInsertAndIterate)->Arg(10'000);

}  // namespace
