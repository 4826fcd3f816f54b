// A failure of a script's request: the reason and the error messages that came with it.
#pragma once

#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace quillon {

class ScriptError : public std::runtime_error {
 public:
  ScriptError(const std::string& reason, std::vector<std::string> messages)
      : std::runtime_error(reason), messages_(std::move(messages)) {}

  // The reason first, then the error messages of the module and the host, each once.
  const std::vector<std::string>& messages() const { return messages_; }

 private:
  std::vector<std::string> messages_;
};

}  // namespace quillon
