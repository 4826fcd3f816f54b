#include "vci/Hx_VpiIterator.h"

#include <utility>

Hx_VpiIterator::Hx_VpiIterator(std::vector<Hx_VpiHandlePtr> objects) : objects_(std::move(objects)) {}

Hx_VpiIterator::~Hx_VpiIterator() = default;

Hx_VpiHandlePtr Hx_VpiIterator::Next() {
  if (position_ >= objects_.size()) {
    return nullptr;
  }
  return objects_[position_++];
}
