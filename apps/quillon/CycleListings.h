// Recognises the module's cycle messages: the listing of the files of one cycle (a header, one
// message per file, an end line), which the strict and the relaxed rule may both give for the
// same cycle, and the warning that the order had to be cut.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "Port/MsgMan.h"

namespace quillon {

class CycleListings {
 public:
  // Takes the next message. Messages outside a listing come back in `ready` at once; a listing is
  // held until its end and then comes back whole, unless the same files were listed before.
  void Take(const Port_MsgRecord& record, std::vector<Port_MsgRecord>& ready);
  // True once the module said that no valid order exists and it cut the cycles.
  bool OrderWasCut() const { return orderWasCut_; }

 private:
  void Release(std::vector<Port_MsgRecord>& ready);

  std::vector<Port_MsgRecord> listing_;
  std::set<std::string> listed_;
  bool orderWasCut_ = false;
};

}  // namespace quillon
