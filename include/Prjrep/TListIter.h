// Iterators over a list of their own.
#pragma once

#include <cstddef>
#include <utility>
#include <vector>

#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Prjrep {

// A counted iterator over its own copy of a list of entries, each handed out as the iterator's
// element interface through Convert. Unlike the set iterators, Next also answers 1 past the end.
template <class IteratorI, class Entry>
class TListIter : public IteratorI {
 public:
  using Element = typename IteratorI::ElementType;

  explicit TListIter(std::vector<Entry> entries) : entries_(std::move(entries)) {}

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IteratorI::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == IRefCount::Iid() || id == IRefCountV1::Iid()) return &refs_;
    return nullptr;
  }
  Element* Current() override { return position_ < entries_.size() ? Convert(entries_[position_]) : nullptr; }
  CitI::Result First() override {
    position_ = 0;
    return CitI::kOk;
  }
  CitI::Result Next() override {
    if (position_ < entries_.size()) ++position_;
    return CitI::kOk;
  }
  bool IsDone() override { return position_ >= entries_.size(); }

 protected:
  // Turns a list entry into the element interface handed out.
  virtual Element* Convert(Entry& entry) = 0;

 private:
  std::vector<Entry> entries_;
  std::size_t position_ = 0;
  TRefCountHelper<> refs_{this};
};

// A list iterator whose entries are the element interfaces themselves, one reference each.
template <class IteratorI>
class TInterfaceListIter final : public TListIter<IteratorI, AutoPtr<typename IteratorI::ElementType>> {
 public:
  using Element = typename IteratorI::ElementType;
  using Base = TListIter<IteratorI, AutoPtr<Element>>;

  // A new iterator over `elements`, carrying its one reference.
  static AutoRelease<IteratorI> New(const std::vector<Element*>& elements) {
    std::vector<AutoPtr<Element>> entries;
    entries.reserve(elements.size());
    for (Element* element : elements) entries.emplace_back(element);
    return AutoRelease<IteratorI>(new TInterfaceListIter(std::move(entries)));
  }

 protected:
  Element* Convert(AutoPtr<Element>& entry) override { return entry.Get(); }

 private:
  using Base::Base;
};

}  // namespace Prjrep
