// An owning pointer to a counted VPI object (Hx_VpiHandlePtr, Hx_VpiIteratorPtr). Every non-null
// pointer holds one reference; copying adds one, destruction and reset give it back, and the
// object dies with its last reference. Assignment takes the new reference before it gives up the
// old one, so self-assignment is safe.
#pragma once

#include <cstddef>
#include <cstdint>
#include <utility>

#include "vci/Hx_VpiCounted.h"

template <class T>
class Hx_VpiPtr {
 public:
  // A new object of type T, held by the returned pointer alone.
  template <class... Args>
  static Hx_VpiPtr Make(Args&&... args) {
    return Hx_VpiPtr(new T(std::forward<Args>(args)...));
  }

  Hx_VpiPtr() noexcept = default;
  Hx_VpiPtr(std::nullptr_t) noexcept {}
  // Takes a reference of its own on `object`; the caller's pointer is not consumed.
  explicit Hx_VpiPtr(T* object) noexcept : object_(object) { AddRefIfSet(); }
  Hx_VpiPtr(const Hx_VpiPtr& other) noexcept : object_(other.object_) { AddRefIfSet(); }
  Hx_VpiPtr(Hx_VpiPtr&& other) noexcept : object_(std::exchange(other.object_, nullptr)) {}
  ~Hx_VpiPtr() { ReleaseIfSet(); }

  Hx_VpiPtr& operator=(Hx_VpiPtr other) noexcept {
    swap(other);
    return *this;
  }

  void reset() noexcept { Hx_VpiPtr().swap(*this); }
  void swap(Hx_VpiPtr& other) noexcept { std::swap(object_, other.object_); }

  T* get() const noexcept { return object_; }
  T* operator->() const noexcept { return object_; }
  T& operator*() const noexcept { return *object_; }
  explicit operator bool() const noexcept { return object_ != nullptr; }
  friend bool operator==(const Hx_VpiPtr& a, const Hx_VpiPtr& b) noexcept { return a.object_ == b.object_; }

  // References held on the object by all pointers together; 0 for a null pointer.
  std::int32_t UseCount() const { return object_ == nullptr ? 0 : Counted()->RefCount(); }

 private:
  Hx_VpiCounted* Counted() const noexcept { return object_; }
  void AddRefIfSet() noexcept {
    if (object_ != nullptr) {
      Counted()->AddRef();
    }
  }
  void ReleaseIfSet() noexcept {
    if (object_ != nullptr) {
      Counted()->Release();
    }
  }

  T* object_ = nullptr;
};
