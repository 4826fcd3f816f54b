// The state of one VPI iteration: the objects to visit, in order, held until the iterator dies.
#pragma once

#include <cstddef>
#include <vector>

#include "vci/Hx_VpiObject.h"
#include "vci/Hx_VpiPtr.h"

class Hx_VpiIterator : public Hx_VpiCounted {
 public:
  explicit Hx_VpiIterator(std::vector<Hx_VpiHandlePtr> objects);

  // The next object, or none once all have been visited.
  Hx_VpiHandlePtr Next();

 protected:
  ~Hx_VpiIterator() override;

 private:
  std::vector<Hx_VpiHandlePtr> objects_;
  std::size_t position_ = 0;
};

using Hx_VpiIteratorPtr = Hx_VpiPtr<Hx_VpiIterator>;
