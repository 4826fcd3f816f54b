// Set-up shared by the benchmarks that run the module's road through the registry.
#pragma once

#include "Host/HostComponents.h"
#include "Port/MsgDispatcher.h"
#include "Port/MsgManDefault.h"

extern "C" void InstFactoryEntry();

namespace bench {

// Registers the host components and the module's factories once per process.
inline bool RegisterComponentsOnce() {
  static const bool registered = [] {
    bool hostComponents = Host::RegisterHostComponents();
    InstFactoryEntry();
    return hostComponents;
  }();
  return registered;
}

// Keeps the default message manager quiet while a benchmark runs. It is taken out of the
// dispatcher rather than disabled, since every parse's message capture enables it again.
class QuietMessages {
 public:
  QuietMessages()
      : manager_(Port_MsgDispatcher::getDefaultMsgMan()),
        wasRegistered_(Port_MsgDispatcher::removeMsgMan(manager_)) {}
  ~QuietMessages() {
    if (wasRegistered_) Port_MsgDispatcher::addMsgMan(manager_);
  }
  QuietMessages(const QuietMessages&) = delete;
  QuietMessages& operator=(const QuietMessages&) = delete;

 private:
  Port_MsgManDefault* manager_;
  bool wasRegistered_;
};

}  // namespace bench
