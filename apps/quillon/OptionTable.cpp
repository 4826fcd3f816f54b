#include "OptionTable.h"

namespace quillon {

namespace {

constexpr CommandSet kProjectCommands =
    SetOf(Command::kUnits) | SetOf(Command::kTree) | SetOf(Command::kOrder) | SetOf(Command::kPorts) |
    SetOf(Command::kCheck) | SetOf(Command::kExport) | SetOf(Command::kWatch);
constexpr CommandSet kDiagnosingCommands =
    SetOf(Command::kTree) | SetOf(Command::kOrder) | SetOf(Command::kCheck) | SetOf(Command::kWatch);

void AddSource(OptionValues& values, SourceArgument::Kind kind, const std::string& path) {
  values.options.sources.push_back({kind, path, values.library, values.plugin});
  values.unapplied.clear();
}

// --lib NAME=PATH: the files of PATH go into library NAME, whatever -l is in effect.
void AddLibraryAssignment(OptionValues& values, const std::string& value) {
  std::size_t equals = value.find('=');
  if (equals == 0 || equals == std::string::npos || equals + 1 == value.size()) {
    if (values.error.empty()) values.error = "--lib needs NAME=PATH, not '" + value + "'";
    return;
  }
  values.options.sources.push_back(
      {SourceArgument::Kind::kFile, value.substr(equals + 1), value.substr(0, equals), values.plugin});
}

}  // namespace

const std::vector<CommandEntry>& OptionTable::Commands() {
  static const std::vector<CommandEntry> commands = {
      {Command::kUnits, "units", "", "the design units of every source file"},
      {Command::kTree, "tree", "", "the design hierarchy"},
      {Command::kOrder, "order", "", "the order in which the source files must be compiled"},
      {Command::kPorts, "ports", "UNIT", "the ports of a design unit"},
      {Command::kCheck, "check", "", "read everything and report problems only"},
      {Command::kFactories, "factories", "", "the classes the module registers"},
      {Command::kExport, "export", "", "the compile order for the tool that compiles it (--to FORMAT)"},
      {Command::kWatch, "watch", "",
       "keep reading the sources and print the view (--show) whenever it changes"},
  };
  return commands;
}

// The order of getCompileOrderByDU with its mode flag set depends on the kind of unit, and the
// help of --unit says so: an entity is ordered from the root of the hierarchy.
const std::vector<OptionEntry>& OptionTable::All() {
  using Kind = SourceArgument::Kind;
  static const std::vector<OptionEntry> options = {
      {"--version", nullptr, "Options", 0, "the version and the module quillon loads",
       [](OptionValues& v, const std::string&) { v.versionAsked = true; }},
      {"--color",
       "WHEN",
       "Options",
       0,
       "colour the messages: auto (on a terminal, unless NO_COLOR is set), always, never",
       [](OptionValues& v, const std::string& value) { v.color = value; },
       {"auto", "always", "never"}},
      {"--help-man", nullptr, "", 0, "the manual page (roff)",
       [](OptionValues& v, const std::string&) { v.manPageAsked = true; }},
      {"--help-words", "COMMAND", "", 0, "the words that complete COMMAND, 'commands' or an option",
       [](OptionValues& v, const std::string& value) { v.completionWordsOf = value; }},

      {"-P,--project", "FILE", "Sources", kProjectCommands,
       "a project file (JSON); its paths are relative to it",
       [](OptionValues& v, const std::string& value) { AddSource(v, Kind::kProjectFile, value); }},
      {"-f", "FILE", "Sources", kProjectCommands,
       "a file list as simulators read it (- for standard input); its paths are relative to here",
       [](OptionValues& v, const std::string& value) { AddSource(v, Kind::kFileList, value); }},
      {"-F", "FILE", "Sources", kProjectCommands, "a file list whose paths are relative to the list",
       [](OptionValues& v, const std::string& value) { AddSource(v, Kind::kFileListRelative, value); }},
      {"-y", "DIR", "Sources", kProjectCommands,
       "a library directory: an instantiated module that no source defines is read from DIR/NAME.v",
       [](OptionValues& v, const std::string& value) { AddSource(v, Kind::kLibraryDir, value); }},
      {"--library-file", "FILE", "Sources", kProjectCommands,
       "a library file (-v in a file list): its modules are read when instantiated and defined nowhere else",
       [](OptionValues& v, const std::string& value) { AddSource(v, Kind::kLibraryFile, value); }},
      {"--lib", "NAME=PATH", "Sources", kProjectCommands,
       "a file, directory or quoted pattern whose files go into library NAME",
       [](OptionValues& v, const std::string& value) { AddLibraryAssignment(v, value); }},
      {"-l,--library", "NAME", "Sources", kProjectCommands,
       "the library of the sources after it (default work)",
       [](OptionValues& v, const std::string& value) {
         v.library = value;
         v.unapplied = "-l " + value;
       }},
      {"--plugin", "NAME", "Sources", kProjectCommands,
       "the plug-in of the sources after it (e.g. PLUGIN_Verilog)",
       [](OptionValues& v, const std::string& value) {
         v.plugin = value;
         v.unapplied = "--plugin " + value;
       }},

      {"-D", "NAME[=VALUE]", "Project properties", kProjectCommands, "a Verilog macro",
       [](OptionValues& v, const std::string& value) { v.options.defines.push_back(value); }},
      {"-I", "DIR", "Project properties", kProjectCommands, "a Verilog include directory",
       [](OptionValues& v, const std::string& value) { v.options.includeDirs.push_back(value); }},
      {"--target", "NAME", "Project properties", kProjectCommands, "the parse target",
       [](OptionValues& v, const std::string& value) { v.options.target = value; }},
      {"--family", "NAME", "Project properties", kProjectCommands, "the device family",
       [](OptionValues& v, const std::string& value) { v.options.family = value; }},
      {"--property", "KEY=VALUE", "Project properties", kProjectCommands, "any project property",
       [](OptionValues& v, const std::string& value) { v.properties.push_back(value); }},
      {"--converter-timeout",
       "SECONDS",
       "Project properties",
       kProjectCommands,
       "the time a converter may take (default 300, 0 for none)",
       [](OptionValues& v, const std::string& value) { v.options.converterTimeout = std::stoul(value); },
       {},
       true},

      {"--top", "UNIT", "Order", SetOf(Command::kOrder) | SetOf(Command::kExport) | SetOf(Command::kTree),
       "the part of the design below UNIT: the files it needs in compile order, or its hierarchy (tree)",
       [](OptionValues& v, const std::string& value) { v.top = value; }},
      {"--unit", "UNIT", "Order", SetOf(Command::kOrder) | SetOf(Command::kExport),
       "by UNIT's kind: a module, its own file; an architecture, the files below its entity; an entity, "
       "every file of the design, ordered from the root",
       [](OptionValues& v, const std::string& value) { v.unit = value; }},
      {"--with-library", nullptr, "Order", SetOf(Command::kOrder),
       "text output: the library before each path",
       [](OptionValues& v, const std::string&) { v.options.withLibrary = true; }},
      {"--to",
       "FORMAT",
       "Export",
       SetOf(Command::kExport),
       "the tool's format",
       [](OptionValues& v, const std::string& value) { v.options.exportTo = value; },
       {"make", "ninja", "depfile", "ghdl", "iverilog", "edam", "tcl"}},

      {"--depth",
       "N",
       "Tree",
       SetOf(Command::kTree),
       "the levels shown below the first; deeper ones are counted",
       [](OptionValues& v, const std::string& value) { v.options.depth = std::stoul(value); },
       {},
       true},
      {"--instances", nullptr, "Tree", SetOf(Command::kTree), "instances only, without entities and packages",
       [](OptionValues& v, const std::string&) { v.options.instancesOnly = true; }},

      {"--external-library", "NAME", "Diagnostics", kDiagnosingCommands,
       "a library outside the project: its units are black boxes",
       [](OptionValues& v, const std::string& value) { v.options.externalLibraries.push_back(value); }},
      {"--strict", nullptr, "Diagnostics", kDiagnosingCommands,
       "instances of units the project lacks are errors, not warnings",
       [](OptionValues& v, const std::string&) { v.options.strict = true; }},
      {"--warnings-as-errors", nullptr, "Diagnostics", SetOf(Command::kCheck), "check fails on warnings too",
       [](OptionValues& v, const std::string&) { v.options.warningsAsErrors = true; }},

      {"--cache", "DIR", "Cache", kProjectCommands,
       "keep parse results in DIR (default with -P: .quillon beside the project file)",
       [](OptionValues& v, const std::string& value) { v.options.cacheDir = value; }},
      {"--no-cache", nullptr, "Cache", kProjectCommands, "parse every file",
       [](OptionValues& v, const std::string&) { v.options.noCache = true; }},
      {"--show",
       "VIEW",
       "Watch",
       SetOf(Command::kWatch),
       "the view that watch prints: order, tree or check",
       [](OptionValues& v, const std::string& value) { v.show = value; },
       {"order", "tree", "check"}},

      {"--format",
       "FORMAT",
       "Output",
       kProjectCommands,
       "text, json, or dot (tree and order only)",
       [](OptionValues& v, const std::string& value) { v.format = value; },
       {"text", "json", "dot"}},
      {"-o", "FILE", "Output", kProjectCommands,
       "write the answer to FILE, replaced only when the command succeeds",
       [](OptionValues& v, const std::string& value) { v.options.outputPath = value; }},
      {"-q", nullptr, "Output", kProjectCommands, "no messages",
       [](OptionValues& v, const std::string&) { v.options.quiet = true; }},
      {"--absolute", nullptr, "Output", kProjectCommands, "full paths, also of sources given relative",
       [](OptionValues& v, const std::string&) { v.options.absolutePaths = true; }},
      {"-v,--verbose", nullptr, "Output", kProjectCommands, "the module's developer texts too",
       [](OptionValues& v, const std::string&) { v.options.verbose = true; }},
  };
  return options;
}

std::vector<std::string> OptionTable::Spellings(const OptionEntry& option) {
  std::vector<std::string> spellings;
  std::string names = option.names;
  for (std::size_t start = 0; start <= names.size();) {
    std::size_t comma = names.find(',', start);
    if (comma == std::string::npos) comma = names.size();
    spellings.push_back(names.substr(start, comma - start));
    start = comma + 1;
  }
  return spellings;
}

const char* OptionTable::UnitText() {
  return "A UNIT is a design-unit key (Entity|cpu, Architecture|cpu|rtl, Module|top) or a name, which "
         "matches an entity, then a module, then any unit of that name.";
}

const char* OptionTable::ExitText() {
  return "Exit status: 0 done, 1 the operation failed or an error was reported, 2 bad usage or input.";
}

}  // namespace quillon
