#include "Host/EventReceiver.h"

#include <algorithm>

namespace Host {

Prjrep::AutoPtr<Prjrep::IEventReceiver> EventReceiver::Create() {
  return Prjrep::AutoRelease<Prjrep::IEventReceiver>(new EventReceiver);
}

CitI::IInterface* EventReceiver::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Prjrep::IEventReceiver::Iid() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result EventReceiver::OnEvent(CitI::IInterface* event) {
  if (!event) return CitI::kInvalidArg;
  events_.emplace_back(event);
  return CitI::kOk;
}

CitI::Result EventReceiver::OnAttach(Prjrep::IEventSender* sender) {
  if (!sender) return CitI::kInvalidArg;
  ++attachCount_;
  if (!IsAttachedTo(sender)) senders_.push_back(sender);
  return CitI::kOk;
}

CitI::Result EventReceiver::OnDetach(Prjrep::IEventSender* sender) {
  if (!sender) return CitI::kInvalidArg;
  auto found = std::find(senders_.begin(), senders_.end(), sender);
  if (found == senders_.end()) return CitI::kFail;
  senders_.erase(found);
  ++detachCount_;
  return CitI::kOk;
}

CitI::IInterface* EventReceiver::EventAt(std::size_t index) const {
  return index < events_.size() ? events_[index].Get() : nullptr;
}

bool EventReceiver::IsAttachedTo(const Prjrep::IEventSender* sender) const {
  return std::find(senders_.begin(), senders_.end(), sender) != senders_.end();
}

}  // namespace Host
