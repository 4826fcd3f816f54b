// Events sent by design-unit elements to receivers that the host registers.
#pragma once

#include "CitI.h"

namespace Prjrep {

class IEventSender;

class IEventReceiver : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{78AF817C-5874-438d-83B7-80A9A1956E24}")
  virtual CitI::Result OnEvent(CitI::IInterface* event) = 0;
  virtual CitI::Result OnAttach(IEventSender* sender) = 0;
  virtual CitI::Result OnDetach(IEventSender* sender) = 0;
};

class IEventSender : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{82108F49-98A8-4f53-92A0-2669D1BA407E}")
  virtual CitI::Result AddReceiver(IEventReceiver* receiver) = 0;
  virtual CitI::Result RemoveReceiver(IEventReceiver* receiver) = 0;
  // Returns whether the event was non-null.
  virtual bool SendEvent(CitI::IInterface* event) = 0;
  virtual CitI::Result Compact() = 0;
};

}  // namespace Prjrep
