// Read access to a compiled design in the manner of the IEEE 1364 procedural interface. Every
// operation accepts a none handle or iterator and then answers none, vpiUndefined or empty text.
// Handles and iterators keep their objects alive on their own, also after the access object dies.
#pragma once

#include <string>

#include "vci/Hx_VpiIterator.h"
#include "vci/Hx_VpiObject.h"

class Hx_VpiAccess {
 public:
  // `design` contains the top-level objects, which an iteration without a reference visits.
  explicit Hx_VpiAccess(Hx_VpiHandlePtr design);

  // The objects of `type` contained in `reference` (none: in the design), or none when there
  // are no such objects.
  Hx_VpiIteratorPtr iterate(int type, const Hx_VpiHandlePtr& reference) const;
  // The iterator's next object, or none at its end.
  Hx_VpiHandlePtr scan(const Hx_VpiIteratorPtr& iterator) const;
  // The object related to `object` by `relation`, or none.
  Hx_VpiHandlePtr handle(int relation, const Hx_VpiHandlePtr& object) const;
  int get(int property, const Hx_VpiHandlePtr& object) const;
  std::string get_str(int property, const Hx_VpiHandlePtr& object) const;

 private:
  Hx_VpiHandlePtr design_;
};
