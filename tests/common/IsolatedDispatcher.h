// Takes every message manager out of the dispatcher for a scope and puts them back, in their order
// and enabled states, afterwards; managers added in the scope are removed.
#pragma once

#include <vector>

#include "Port/MsgDispatcher.h"

class IsolatedDispatcher {
 public:
  IsolatedDispatcher() {
    Port_MsgDispatcher::getAllMsgMans(saved_);
    for (Port_MsgMan* man : saved_) {
      wasEnabled_.push_back(man->isEnabled());
      Port_MsgDispatcher::removeMsgMan(man);
    }
  }
  ~IsolatedDispatcher() {
    std::vector<Port_MsgMan*> left;
    Port_MsgDispatcher::getAllMsgMans(left);
    for (Port_MsgMan* man : left) Port_MsgDispatcher::removeMsgMan(man);
    for (std::size_t i = 0; i < saved_.size(); ++i) {
      Port_MsgDispatcher::addMsgMan(saved_[i]);
      wasEnabled_[i] ? saved_[i]->enable() : saved_[i]->disable();
    }
  }

 private:
  std::vector<Port_MsgMan*> saved_;
  std::vector<bool> wasEnabled_;
};
