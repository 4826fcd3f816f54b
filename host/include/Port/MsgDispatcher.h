// The process-wide message dispatcher: the registered message managers and the delivery of a
// message to them.
#pragma once

#include <vector>

#include "Port/MsgMan.h"

class Port_MsgManDefault;

// Static service; its state lives in the shared host library, one per process. Managers are not
// owned: a manager unregisters itself when it is destroyed. Use from the host's calling thread only.
class Port_MsgDispatcher {
 public:
  Port_MsgDispatcher() = delete;

  // Registers `man` after the managers already registered. False for null or for a manager that is
  // already registered (it keeps its place).
  static bool addMsgMan(Port_MsgMan* man);
  // False when `man` is not registered.
  static bool removeMsgMan(Port_MsgMan* man);
  static bool isRegistered(const Port_MsgMan* man);

  // The default manager (writes to standard error), created and registered when the dispatcher is
  // first used. It stays the default even while it is not registered; it is never destroyed.
  static Port_MsgManDefault* getDefaultMsgMan();

  // Replaces `mans` with the registered managers in registration order.
  static void getAllMsgMans(std::vector<Port_MsgMan*>& mans);

  // Hands `record` to every registered manager that is enabled, in registration order. A manager
  // may add or remove managers while it handles the message: managers removed meanwhile get
  // nothing more, managers added meanwhile get the next message.
  static void dispatch(const Port_MsgRecord& record);
};
