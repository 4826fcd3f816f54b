#include "ManPage.h"

#include <algorithm>
#include <string>
#include <vector>

#include "OptionTable.h"

namespace quillon {

namespace {

// Dashes are written as \- so that they stay ASCII hyphens that can be searched and pasted; a line
// that starts with a dot or an apostrophe would be taken for a request.
std::string Escaped(const std::string& text) {
  std::string out;
  for (char c : text) {
    if (c == '\\')
      out += "\\e";
    else if (c == '-')
      out += "\\-";
    else
      out += c;
  }
  if (!out.empty() && (out[0] == '.' || out[0] == '\'')) out.insert(0, "\\&");
  return out;
}

std::string CommandsOf(const OptionEntry& option) {
  if (option.commands == 0) return {};
  std::vector<std::string> names;
  std::size_t all = 0;
  for (const CommandEntry& command : OptionTable::Commands()) {
    if (command.command == Command::kFactories) continue;
    ++all;
    if (option.commands & SetOf(command.command)) names.push_back(command.name);
  }
  if (names.size() == all) return {};
  std::string text = " (";
  for (std::size_t i = 0; i < names.size(); ++i) text += (i ? ", " : "") + names[i];
  return text + " only)";
}

void WriteOption(const OptionEntry& option, std::ostream& out) {
  out << ".TP\n";
  std::vector<std::string> spellings = OptionTable::Spellings(option);
  for (std::size_t i = 0; i < spellings.size(); ++i)
    out << (i ? ", " : "") << "\\fB" << Escaped(spellings[i]) << "\\fR";
  if (option.value) out << " \\fI" << Escaped(option.value) << "\\fR";
  out << "\n" << Escaped(option.help) << Escaped(CommandsOf(option)) << "\n";
}

}  // namespace

void ManPage::Write(std::ostream& out) {
  out << ".TH QUILLON 1 \"\" \"quillon " << QUILLON_VERSION << "\" \"User Commands\"\n"
      << ".SH NAME\nquillon \\- design units, hierarchy and compile order of HDL sources\n"
      << ".SH SYNOPSIS\n.B quillon\n[\\fIOPTIONS\\fR] \\fICOMMAND\\fR [\\fIOPTIONS\\fR] [\\fISOURCE\\fR...]\n"
      << ".SH DESCRIPTION\nquillon reads VHDL, Verilog, EDIF and other HDL sources, finds their design "
         "units, "
         "builds the design hierarchy and computes the order in which the files must be compiled. A SOURCE "
         "is a file whose plug\\-in follows from its extension. Options may stand before or after the "
         "command.\n.SH COMMANDS\n";
  for (const CommandEntry& command : OptionTable::Commands()) {
    out << ".TP\n\\fB" << command.name << "\\fR";
    if (*command.operands) out << " \\fI" << command.operands << "\\fR";
    out << "\n" << Escaped(command.summary) << "\n";
  }
  out << ".TP\n\\fBhelp\\fR [\\fICOMMAND\\fR]\nthe list of commands, or the options of COMMAND\n";
  // quillon's own options first, then those of the commands under their headings.
  out << ".SH OPTIONS\n.TP\n\\fB\\-h\\fR, \\fB\\-\\-help\\fR\nthe help of quillon or of the command\n";
  std::vector<std::string> groups;
  for (const OptionEntry& option : OptionTable::All()) {
    if (!*option.group) continue;
    if (option.commands == 0)
      WriteOption(option, out);
    else if (std::find(groups.begin(), groups.end(), option.group) == groups.end())
      groups.push_back(option.group);
  }
  for (const std::string& group : groups) {
    out << ".SS " << group << "\n";
    for (const OptionEntry& option : OptionTable::All()) {
      if (option.commands != 0 && option.group == group) WriteOption(option, out);
    }
  }
  out << ".SH ENVIRONMENT\n"
      << ".TP\n\\fBQUILLON_MODULE\\fR\nthe module to load, in place of the one installed with quillon\n"
      << ".TP\n\\fBNO_COLOR\\fR\nwhen set and not empty, messages are not coloured unless \\fB\\-\\-color "
         "always\\fR is given\n"
      << ".SH EXIT STATUS\n"
      << Escaped(OptionTable::ExitText()) << "\n"
      << ".SH NOTES\n"
      << Escaped(OptionTable::UnitText()) << "\n";
}

}  // namespace quillon
