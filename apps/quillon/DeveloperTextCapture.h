// Keeps the module's developer texts of one query, passing them on as well. The module gives the
// reason for a missing port list as a developer text ("ports of KEY: reason").
#pragma once

#include <string>

#include "Port/MsgManData.h"

namespace quillon {

class DeveloperTextCapture {
 public:
  DeveloperTextCapture();
  ~DeveloperTextCapture();
  DeveloperTextCapture(const DeveloperTextCapture&) = delete;
  DeveloperTextCapture& operator=(const DeveloperTextCapture&) = delete;

  // The last line that starts with `lead`, without its line end; empty when there is none.
  std::string LastLineStartingWith(const std::string& lead) const;

 private:
  std::string text_;
  Port_MsgManData::DebugSink previous_;
};

}  // namespace quillon
