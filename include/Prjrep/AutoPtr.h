// Smart pointers over counted interfaces.
//
//   AutoPtr<I>     owns one reference; assigning a raw pointer takes a new one.
//   AutoRelease<I> owns one reference handed over by a callee (creation result, out-parameter).
//   AutoCast<I>    a typed view of a pointer the caller already holds; owns nothing.
//   AutoOut<I>     the caller's out-parameter slot; Set writes a pointer with a reference added.
#pragma once

#include <cstddef>
#include <utility>

#include "CitI.h"
#include "Prjrep/RefCounting.h"
#include "RavA/Factory.h"

namespace Prjrep {

// The interface `I` that `object` answers, or null. Takes no reference.
template <class I>
I* QueryAs(CitI::IInterface* object) {
  return object ? static_cast<I*>(object->QueryInterface(I::Iid())) : nullptr;
}

template <class I>
class AutoPtr {
 public:
  AutoPtr() = default;
  AutoPtr(std::nullptr_t) {}  // NOLINT
  // Queries `object` for I and takes a reference on the answer.
  explicit AutoPtr(CitI::IInterface* object) { Assign(object); }
  AutoPtr(const AutoPtr& other) { Assign(other.ptr_); }
  AutoPtr(AutoPtr&& other) noexcept : ptr_(std::exchange(other.ptr_, nullptr)) {}
  ~AutoPtr() { Reset(); }

  AutoPtr& operator=(const AutoPtr& other) {
    Assign(other.ptr_);
    return *this;
  }
  AutoPtr& operator=(AutoPtr&& other) noexcept {
    if (this != &other) Attach(std::exchange(other.ptr_, nullptr));
    return *this;
  }
  AutoPtr& operator=(CitI::IInterface* object) {
    Assign(object);
    return *this;
  }
  AutoPtr& operator=(std::nullptr_t) {
    Reset();
    return *this;
  }

  // Asks `object` for I; when the answer is what is held already nothing happens; otherwise the
  // answer gains a reference before the old pointer loses one, so self-assignment is safe.
  void Assign(CitI::IInterface* object) {
    I* wanted = QueryAs<I>(object);
    if (wanted == ptr_) return;
    AddRefOf(wanted);
    I* old = std::exchange(ptr_, wanted);
    ReleaseOf(old);
  }
  // Takes over a reference the caller owns, without adding one.
  void Attach(I* owned) {
    I* old = std::exchange(ptr_, owned);
    if (old != owned) ReleaseOf(old);
  }
  // Gives up the reference without releasing it.
  [[nodiscard]] I* Detach() { return std::exchange(ptr_, nullptr); }
  void Reset() { ReleaseOf(std::exchange(ptr_, nullptr)); }

  // The slot for a callee's out-parameter: what was held is released first, and the callee's
  // reference becomes this pointer's.
  I** Out() {
    Reset();
    return &ptr_;
  }
  // Hands a new reference to a caller's out-parameter.
  CitI::Result CopyTo(I** out) const {
    if (!out) return CitI::kInvalidArg;
    *out = ptr_;
    AddRefOf(ptr_);
    return CitI::kOk;
  }

  I* Get() const { return ptr_; }
  I* operator->() const { return ptr_; }
  explicit operator bool() const { return ptr_ != nullptr; }
  friend bool operator==(const AutoPtr& a, const AutoPtr& b) { return a.ptr_ == b.ptr_; }

 private:
  I* ptr_ = nullptr;
};

template <class I>
class AutoRelease : public AutoPtr<I> {
 public:
  AutoRelease() = default;
  explicit AutoRelease(I* owned) { this->Attach(owned); }
  AutoRelease& operator=(I* owned) {
    this->Attach(owned);
    return *this;
  }
};

template <class I>
class AutoCast {
 public:
  explicit AutoCast(CitI::IInterface* object) : ptr_(QueryAs<I>(object)) {}
  I* Get() const { return ptr_; }
  I* operator->() const { return ptr_; }
  explicit operator bool() const { return ptr_ != nullptr; }

 private:
  I* ptr_;
};

template <class I>
class AutoOut {
 public:
  // Clears the caller's slot at once, as every out-parameter is cleared first.
  explicit AutoOut(I** slot) : slot_(slot) {
    if (slot_) *slot_ = nullptr;
  }
  bool IsMissing() const { return slot_ == nullptr; }
  // Writes `value` with one reference added, releasing what an earlier Set wrote.
  void Set(I* value) {
    if (!slot_) return;
    AddRefOf(value);
    ReleaseOf(std::exchange(*slot_, value));
  }
  I* Get() const { return slot_ ? *slot_ : nullptr; }

 private:
  I** slot_;
};

// Creates an object through the host registry and answers its interface I, or null.
template <class I>
AutoPtr<I> CreateInstanceAs(const Port::XUID& classId) {
  AutoRelease<CitI::IInterface> created(RavA::Factory::CreateInstance(classId));
  return AutoPtr<I>(created.Get());
}

}  // namespace Prjrep
