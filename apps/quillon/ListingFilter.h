// Keeps repeated listings and blank lines of the module's messages off the terminal. A listing is
// a message ending in ':' followed by indented messages (the module lists the files of a cycle
// this way, and lists the same cycle again under its relaxed rule); it is held back until it is
// complete and printed only the first time. Blank messages are not printed at all.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "Port/MsgMan.h"

namespace quillon {

class ListingFilter {
 public:
  struct Message {
    Port_MsgMan::MsgType type;
    std::vector<std::wstring> lines;
  };

  // The messages to print now, in order: none while a listing is being held back.
  std::vector<Message> Take(Message message);
  // The listing held back, if it is printed at all.
  std::vector<Message> Flush();

 private:
  std::vector<Message> listing_;
  std::set<std::vector<std::wstring>> printed_;
};

}  // namespace quillon
