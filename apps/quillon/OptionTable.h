// Every command and option of quillon, declared once: the parser, the help, the manual page and
// the shell completion are all made from these tables.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "Options.h"

namespace quillon {

// What the options of one command line collect, in command-line order, before they are checked.
struct OptionValues {
  explicit OptionValues(Options& options) : options(options) {}

  Options& options;
  std::string library, plugin;  // in effect for the sources that follow
  std::string unapplied;        // the -l or --plugin given last while no source followed it yet
  std::string error;            // the first value that an option cannot take
  std::vector<std::string> properties;
  std::string top, unit, format = "text", color = "auto", show = "order";
  bool versionAsked = false;
  bool manPageAsked = false;
  std::optional<std::string> completionWordsOf;
};

// The commands an option applies to, one bit per Command.
using CommandSet = unsigned;
constexpr CommandSet SetOf(Command command) { return 1u << static_cast<unsigned>(command); }

struct CommandEntry {
  Command command;
  const char* name;
  const char* operands;  // "UNIT" for ports, else ""
  const char* summary;
};

struct OptionEntry {
  const char* names;  // "-l,--library"
  const char* value;  // the value's name in the help; null for a flag
  const char* group;  // the heading in the help; "" hides the option
  // Zero for the options of quillon itself (help, version, colour), given before any command.
  CommandSet commands;
  const char* help;
  void (*take)(OptionValues& values, const std::string& value);
  std::vector<std::string> choices = {};  // the values allowed; empty for any
  bool number = false;                    // a non-negative whole number
};

class OptionTable {
 public:
  static const std::vector<CommandEntry>& Commands();
  static const std::vector<OptionEntry>& All();
  // The words of `names` as typed: "-l,--library" -> {"-l", "--library"}.
  static std::vector<std::string> Spellings(const OptionEntry& option);
  // What a UNIT is, and the exit statuses: the closing words of the help and the manual page.
  static const char* UnitText();
  static const char* ExitText();
};

}  // namespace quillon
