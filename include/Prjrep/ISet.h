// The shapes shared by every set interface and every iterator interface.
#pragma once

#include <cstdint>

#include "CitI.h"

namespace Prjrep {

// Iterator slots: 2 Current (null past the end), 3 First, 4 Next, 5 IsDone.
template <class Element>
class IIteratorOf : public CitI::IInterface {
 public:
  using ElementType = Element;
  virtual Element* Current() = 0;
  virtual CitI::Result First() = 0;
  virtual CitI::Result Next() = 0;
  virtual bool IsDone() = 0;
};

// Set slots: 2 Add, 3 Remove (the element an iterator stands on; the iterator advances),
// 4 CreateIterator, 5 GetCount, 6 Clear.
template <class Element, class Iterator>
class ISetOf : public CitI::IInterface {
 public:
  using ElementType = Element;
  using IteratorType = Iterator;
  virtual CitI::Result Add(Element* element) = 0;
  virtual CitI::Result Remove(Iterator* position) = 0;
  virtual CitI::Result CreateIterator(Iterator** iterator) = 0;
  virtual std::uint32_t GetCount() = 0;
  virtual CitI::Result Clear() = 0;
};

}  // namespace Prjrep
