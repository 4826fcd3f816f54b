#include "Port/MsgDispatcher.h"

#include <algorithm>

#include "Port/MsgManDefault.h"

namespace {

// The default manager exists and is registered from the first use of the dispatcher on, so that
// no message issued before anyone asked for it is lost.
struct DispatcherState {
  DispatcherState() : defaultMan(new Port_MsgManDefault("default")), managers{defaultMan} {}
  Port_MsgManDefault* defaultMan;
  std::vector<Port_MsgMan*> managers;
};

// Never destroyed, nor is the default manager: managers may unregister themselves from static
// destructors that run after this file's own statics would be gone.
DispatcherState& State() {
  static auto* state = new DispatcherState;
  return *state;
}

std::vector<Port_MsgMan*>::iterator Find(const Port_MsgMan* man) {
  auto& managers = State().managers;
  return std::find(managers.begin(), managers.end(), man);
}

}  // namespace

bool Port_MsgDispatcher::addMsgMan(Port_MsgMan* man) {
  if (!man || isRegistered(man)) return false;
  State().managers.push_back(man);
  return true;
}

bool Port_MsgDispatcher::removeMsgMan(Port_MsgMan* man) {
  auto it = Find(man);
  if (it == State().managers.end()) return false;
  State().managers.erase(it);
  return true;
}

bool Port_MsgDispatcher::isRegistered(const Port_MsgMan* man) {
  return man && Find(man) != State().managers.end();
}

Port_MsgManDefault* Port_MsgDispatcher::getDefaultMsgMan() { return State().defaultMan; }

void Port_MsgDispatcher::getAllMsgMans(std::vector<Port_MsgMan*>& mans) { mans = State().managers; }

void Port_MsgDispatcher::dispatch(const Port_MsgRecord& record) {
  // A manager's hooks may change the registrations, so walk a copy and re-check each entry.
  const std::vector<Port_MsgMan*> snapshot = State().managers;
  for (Port_MsgMan* man : snapshot) {
    if (isRegistered(man) && man->isEnabled()) man->deliverMsg(record);
  }
}
