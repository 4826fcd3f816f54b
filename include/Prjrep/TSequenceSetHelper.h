// Sets in insertion order.
#pragma once

#include <cstddef>
#include <vector>

#include "Prjrep/TSetHelper.h"

namespace Prjrep {

// A set in insertion order that allows duplicates and holds one reference on each element. It
// is embedded in an owner, which counts references for it (see SetOwner).
template <class SetI>
class TSequenceSetHelper : public TSetHelper<SetI> {
 public:
  using Base = TSetHelper<SetI>;
  using Element = typename Base::Element;
  using Iterator = typename Base::Iterator;
  using Position = std::size_t;

  TSequenceSetHelper() = default;
  ~TSequenceSetHelper() override { Clear(); }

  CitI::Result Add(Element* element) override {
    if (!element) return CitI::kFail;
    AddRefOf(element);
    elements_.push_back(element);
    return CitI::kOk;
  }
  CitI::Result Remove(Iterator* position) override {
    auto* own = OwnIterator(this, position);
    if (!own) return CitI::kFail;
    EraseIndex(own->position());  // the iterator now stands on the next element
    return CitI::kOk;
  }
  CitI::Result CreateIterator(Iterator** iterator) override { return CreateSetIterator(this, iterator); }
  std::uint32_t GetCount() override { return static_cast<std::uint32_t>(elements_.size()); }
  CitI::Result Clear() override {
    std::vector<Element*> released;
    released.swap(elements_);
    for (Element* element : released) ReleaseOf(element);
    return CitI::kOk;
  }
  CitI::Result EraseAt(Iterator* position) override { return Remove(position); }
  Element* ElementAt(Iterator* position) override {
    auto* own = OwnIterator(this, position);
    return own ? At(own->position()) : nullptr;
  }

  // Direct access for the module's own code.
  const std::vector<Element*>& Elements() const { return elements_; }
  void Reserve(std::size_t count) { elements_.reserve(count); }

  // Positions, for the iterator helper.
  Position Begin() const { return 0; }
  bool AtEnd(const Position& position) const { return position >= elements_.size(); }
  void Advance(Position& position) const { ++position; }
  Element* At(const Position& position) const {
    return position < elements_.size() ? elements_[position] : nullptr;
  }

 private:
  void EraseIndex(std::size_t index) {
    Element* element = elements_[index];
    elements_.erase(elements_.begin() + static_cast<std::ptrdiff_t>(index));
    ReleaseOf(element);
  }

  std::vector<Element*> elements_;
};

// A sequence set with a counter of its own, handed to callers as a result and destroyed when
// its count reaches zero. Create one with New().
template <class SetI>
class TRefdSequenceSetHelper final : public TSequenceSetHelper<SetI> {
 public:
  // A new set carrying its one reference.
  static AutoRelease<SetI> New() { return AutoRelease<SetI>(new TRefdSequenceSetHelper); }

 protected:
  CitI::IInterface* QueryOwnCounter(const Port::XUID& id) override {
    if (id == IRefCount::Iid() || id == IRefCountV1::Iid()) return &refs_;
    return nullptr;
  }

 private:
  TRefdSequenceSetHelper() = default;
  TRefCountHelper<> refs_{this};
};

}  // namespace Prjrep
