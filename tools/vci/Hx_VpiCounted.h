// Base of every object reached through a VPI handle or iterator. Such objects live by their
// reference count and are destroyed when the last Hx_VpiPtr to them lets go; only Hx_VpiPtr
// changes the count.
#pragma once

#include <cstdint>

template <class T>
class Hx_VpiPtr;

class Hx_VpiCounted {
 public:
  Hx_VpiCounted(const Hx_VpiCounted&) = delete;
  Hx_VpiCounted& operator=(const Hx_VpiCounted&) = delete;

  std::int32_t RefCount() const;

 protected:
  Hx_VpiCounted();
  // Protected so that an object can neither live on the stack nor be deleted past its count.
  virtual ~Hx_VpiCounted();

 private:
  template <class T>
  friend class Hx_VpiPtr;

  void AddRef() noexcept;
  void Release() noexcept;

  std::int32_t refs_ = 0;
};
