// The event sender of design-unit elements.
#pragma once

#include <vector>

#include "IEventSender.h"

namespace Prjrep {

// Receivers are listed without references. Removing one empties its entry instead of erasing
// it, so that a send in progress walks on undisturbed; Compact drops the empty entries.
class CEventSenderHelper final : public IEventSender {
 public:
  explicit CEventSenderHelper(CitI::IInterface* owner) : owner_(owner) {}
  ~CEventSenderHelper() override;
  CEventSenderHelper(const CEventSenderHelper&) = delete;
  CEventSenderHelper& operator=(const CEventSenderHelper&) = delete;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  CitI::Result AddReceiver(IEventReceiver* receiver) override;
  CitI::Result RemoveReceiver(IEventReceiver* receiver) override;
  bool SendEvent(CitI::IInterface* event) override;
  CitI::Result Compact() override;

  std::size_t EntryCount() const { return receivers_.size(); }

 private:
  bool IsListed(IEventReceiver* receiver) const;

  CitI::IInterface* owner_;
  std::vector<IEventReceiver*> receivers_;
  bool closing_ = false;
};

}  // namespace Prjrep
