// Splits a command line into program arguments the way the tool commands are written, so that
// programs can be started without a shell.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace Port {

class CommandLine {
 public:
  // Blanks (space, tab, line ends) separate arguments. Double quotes group text, blanks
  // included, and are removed; `""` is an empty argument; inside quotes `\"` gives a literal
  // quote, and an unclosed quote runs to the end. Every other character, backslash included,
  // is kept as it is: nothing is expanded or interpreted. Replaces `arguments` and returns
  // their number.
  static std::size_t Split(std::string_view commandLine, std::vector<std::string>* arguments);
};

}  // namespace Port
