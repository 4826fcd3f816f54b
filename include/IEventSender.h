// Events sent by design-unit elements to receivers that the host registers.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Prjrep {

class IEventSender;

class IEventReceiver : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IEventReceiver)
  virtual CitI::Result OnEvent(CitI::IInterface* event) = 0;
  virtual CitI::Result OnAttach(IEventSender* sender) = 0;
  virtual CitI::Result OnDetach(IEventSender* sender) = 0;
};

class IEventSender : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IEventSender)
  virtual CitI::Result AddReceiver(IEventReceiver* receiver) = 0;
  virtual CitI::Result RemoveReceiver(IEventReceiver* receiver) = 0;
  // Returns whether the event was non-null.
  virtual bool SendEvent(CitI::IInterface* event) = 0;
  virtual CitI::Result Compact() = 0;
};

}  // namespace Prjrep
