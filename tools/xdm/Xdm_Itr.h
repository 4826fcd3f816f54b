// Forward iteration over the objects that a netlist database object owns, in their stored order.
#pragma once

#include <cstddef>
#include <memory>
#include <vector>

template <class T>
class Xdm_Itr {
 public:
  // `items` is owned by the object that handed out the iterator and must outlive it.
  explicit Xdm_Itr(const std::vector<std::unique_ptr<T>>& items) : items_(&items) {}

  // The next object, or null once all have been visited.
  T* Next() {
    if (position_ >= items_->size()) {
      return nullptr;
    }
    return (*items_)[position_++].get();
  }

 private:
  const std::vector<std::unique_ptr<T>>* items_;
  std::size_t position_ = 0;
};
