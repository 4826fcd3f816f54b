// Faces: member objects through which an implementation class answers one more interface.
#pragma once

#include "CitI.h"

namespace Prjrep {

// A face holds only its owner; queries go to the owner, and destroying a face does nothing to
// the owner. Derived faces forward each operation to the owner's implementation.
template <class Interface, class Owner>
class TFace : public Interface {
 public:
  explicit TFace(Owner* owner) : owner_(owner) {}
  TFace(const TFace&) = delete;
  TFace& operator=(const TFace&) = delete;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override { return owner_->QueryInterface(id); }

 protected:
  Owner* owner() const { return owner_; }

 private:
  Owner* owner_;
};

}  // namespace Prjrep
