// An event receiver (Prjrep::IEventReceiver) that records what it is told, for hosts and tests.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "IEventSender.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

// Holds one reference on every event it records. Senders are remembered without a reference:
// a sender detaches its receivers when it is destroyed.
class EventReceiver final : public Prjrep::IEventReceiver {
 public:
  static Prjrep::AutoPtr<Prjrep::IEventReceiver> Create();

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // kInvalidArg for a null event or sender; detaching a sender that is not attached gives kFail.
  CitI::Result OnEvent(CitI::IInterface* event) override;
  CitI::Result OnAttach(Prjrep::IEventSender* sender) override;
  CitI::Result OnDetach(Prjrep::IEventSender* sender) override;

  std::size_t EventCount() const { return events_.size(); }
  // The recorded event's IInterface face, in arrival order; null past the end.
  CitI::IInterface* EventAt(std::size_t index) const;
  void ClearEvents() { events_.clear(); }
  std::uint32_t AttachCount() const { return attachCount_; }
  std::uint32_t DetachCount() const { return detachCount_; }
  bool IsAttachedTo(const Prjrep::IEventSender* sender) const;

 private:
  EventReceiver() = default;

  Prjrep::TRefCountHelper<> refCount_{this};
  std::vector<Prjrep::AutoPtr<CitI::IInterface>> events_;
  std::vector<Prjrep::IEventSender*> senders_;
  std::uint32_t attachCount_ = 0;
  std::uint32_t detachCount_ = 0;
};

}  // namespace Host
