#include "Options.h"

#include <CLI/CLI.hpp>
#include <cstdio>
#include <map>

namespace quillon {

namespace {

constexpr const char* kUsage =
    "usage: quillon [options] COMMAND [SOURCE...]\n"
    "\n"
    "commands:\n"
    "  units        the design units of every source file\n"
    "  tree         the design hierarchy\n"
    "  order        the order in which the source files must be compiled\n"
    "  ports UNIT   the ports of a design unit\n"
    "  check        read everything and report problems only\n"
    "  factories    the classes the module registers\n"
    "  export --to make|ninja|depfile|ghdl|iverilog|edam|tcl\n"
    "               the compile order as a build file or tool script (--top UNIT: its files)\n"
    "\n"
    "sources:\n"
    "  SOURCE                a source file; the plug-in follows from its extension\n"
    "  -P, --project FILE    a project file (JSON); its paths are relative to it\n"
    "  DIR, 'GLOB'           the HDL files under a directory or matching a pattern, sorted\n"
    "  -f FILE, -F FILE      a file list as simulators read it (-F: paths relative to the list)\n"
    "  -y DIR, -v FILE       where instantiated modules that no source defines are looked for\n"
    "  +incdir+DIR, +define+NAME=VALUE, +libext+.v  as in a file list\n"
    "  --lib NAME=PATH       a file, directory or pattern whose files go into library NAME\n"
    "  -l, --library NAME    the library of the sources after it (default work)\n"
    "  --plugin NAME         the plug-in of the sources after it (e.g. PLUGIN_Verilog)\n"
    "\n"
    "project properties:\n"
    "  -D NAME[=VALUE]       a Verilog macro\n"
    "  -I DIR                a Verilog include directory\n"
    "  --target NAME         the parse target\n"
    "  --family NAME         the device family\n"
    "  --property KEY=VALUE  any project property\n"
    "  --converter-timeout SECONDS  the time a converter may take (default 300, 0 for none)\n"
    "\n"
    "tree:\n"
    "  --top UNIT            the subtree below UNIT\n"
    "  --depth N             N levels below the first; deeper nodes are counted\n"
    "  --instances           instances only, no entity or package nodes\n"
    "\n"
    "order:\n"
    "  --top UNIT            the order for UNIT and what it needs\n"
    "  --unit UNIT           the order for UNIT alone\n"
    "  --with-library        text output: the library before each path\n"
    "\n"
    "diagnostics:\n"
    "  --external-library NAME  a library outside the project: its units are black boxes\n"
    "  --strict              instances of units the project lacks are errors, not warnings\n"
    "  --warnings-as-errors  check fails on warnings too\n"
    "\n"
    "output:\n"
    "  --format text|json|dot, -o FILE, -q (no messages), --verbose (developer texts too)\n"
    "  --absolute            full paths, also for sources given relative\n"
    "\n"
    "A UNIT is a design-unit key (Entity|cpu, Architecture|cpu|rtl, Module|top) or a name.\n"
    "Exit status: 0 done, 1 the operation failed or an error was reported, 2 bad usage or input.\n";

const std::map<std::string, Command>& CommandNames() {
  static const std::map<std::string, Command> names = {
      {"units", Command::kUnits},  {"tree", Command::kTree},   {"order", Command::kOrder},
      {"ports", Command::kPorts},  {"check", Command::kCheck}, {"factories", Command::kFactories},
      {"export", Command::kExport}};
  return names;
}

// Each occurrence of an option takes exactly one value, so that "-l lib a.vhd" leaves a.vhd a
// source.
CLI::Option* AddRepeated(CLI::App& app, const std::string& names, std::vector<std::string>& values) {
  return app.add_option(names, values)
      ->allow_extra_args(false)
      ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
}

bool SplitAssignment(const std::string& text, std::pair<std::string, std::string>& out) {
  std::size_t equals = text.find('=');
  if (equals == 0 || equals == std::string::npos) return false;
  out = {text.substr(0, equals), text.substr(equals + 1)};
  return true;
}

// The raw values that CLI11 collected, walked again in command-line order.
class ArgumentWalk {
 public:
  explicit ArgumentWalk(const CLI::App& app) : app_(app) {}
  template <class Visit>
  void ForEach(Visit visit) {
    std::map<const CLI::Option*, std::size_t> taken;
    for (const CLI::Option* option : app_.parse_order()) {
      std::size_t index = taken[option]++;
      const std::vector<std::string>& results = option->results();
      visit(option, index < results.size() ? results[index] : std::string());
    }
  }

 private:
  const CLI::App& app_;
};

class Parser {
 public:
  explicit Parser(Options& options) : options_(options) {}

  Options::Outcome Run(int argc, const char* const* argv, std::string& error);

 private:
  void Declare();
  bool TakePositionals(const std::vector<std::string>& positionals, std::string& error);
  bool CheckCombination(std::string& error) const;

  Options& options_;
  CLI::App app_{"quillon"};
  bool help_ = false;
  std::vector<std::string> positionals_, projects_, lists_, libraries_, plugins_, properties_;
  std::vector<std::string> relativeLists_, libraryDirs_, libraryFiles_, libraryAssignments_;
  std::string top_, unit_, format_ = "text";
  CLI::Option* positionalOption_ = nullptr;
  CLI::Option* projectOption_ = nullptr;
  CLI::Option* listOption_ = nullptr;
  CLI::Option* libraryOption_ = nullptr;
  CLI::Option* pluginOption_ = nullptr;
  std::map<const CLI::Option*, SourceArgument::Kind> sourceKinds_;
  CLI::Option* libraryAssignmentOption_ = nullptr;
};

void Parser::Declare() {
  app_.set_help_flag();
  app_.add_flag("-h,--help", help_);
  positionalOption_ = app_.add_option("args", positionals_);
  projectOption_ = AddRepeated(app_, "-P,--project", projects_);
  listOption_ = AddRepeated(app_, "-f", lists_);
  libraryOption_ = AddRepeated(app_, "-l,--library", libraries_);
  pluginOption_ = AddRepeated(app_, "--plugin", plugins_);
  using Kind = SourceArgument::Kind;
  sourceKinds_ = {{positionalOption_, Kind::kFile},
                  {projectOption_, Kind::kProjectFile},
                  {listOption_, Kind::kFileList},
                  {AddRepeated(app_, "-F", relativeLists_), Kind::kFileListRelative},
                  {AddRepeated(app_, "-y", libraryDirs_), Kind::kLibraryDir},
                  {AddRepeated(app_, "-v", libraryFiles_), Kind::kLibraryFile}};
  libraryAssignmentOption_ = AddRepeated(app_, "--lib", libraryAssignments_);
  app_.add_flag("--absolute", options_.absolutePaths);
  AddRepeated(app_, "-D", options_.defines);
  AddRepeated(app_, "-I", options_.includeDirs);
  app_.add_option("--target", options_.target);
  app_.add_option("--family", options_.family);
  AddRepeated(app_, "--property", properties_);
  app_.add_option("--converter-timeout", options_.converterTimeout)->check(CLI::NonNegativeNumber);
  app_.add_option("--top", top_);
  app_.add_option("--unit", unit_);
  app_.add_flag("--with-library", options_.withLibrary);
  app_.add_option("--depth", options_.depth)->check(CLI::NonNegativeNumber);
  app_.add_flag("--instances", options_.instancesOnly);
  app_.add_option("--to", options_.exportTo)
      ->check(CLI::IsMember({"make", "ninja", "depfile", "ghdl", "iverilog", "edam", "tcl"}));
  app_.add_option("--format", format_)->check(CLI::IsMember({"text", "json", "dot"}));
  app_.add_option("-o", options_.outputPath);
  app_.add_flag("-q", options_.quiet);
  app_.add_flag("--verbose", options_.verbose);
  AddRepeated(app_, "--external-library", options_.externalLibraries);
  app_.add_flag("--strict", options_.strict);
  app_.add_flag("--warnings-as-errors", options_.warningsAsErrors);
}

Options::Outcome Parser::Run(int argc, const char* const* argv, std::string& error) {
  Declare();
  try {
    app_.parse(argc, argv);
  } catch (const CLI::ParseError& failure) {
    error = failure.what();
    return Options::Outcome::kUsageError;
  }
  if (help_) {
    std::fputs(kUsage, stdout);
    return Options::Outcome::kHelpShown;
  }

  std::string library, plugin;
  // The -l or --plugin given last while no source followed it yet.
  std::string unapplied;
  ArgumentWalk(app_).ForEach([&](const CLI::Option* option, const std::string& value) {
    if (option == libraryOption_) library = value;
    if (option == pluginOption_) plugin = value;
    if (option == libraryOption_ || option == pluginOption_) unapplied = option->get_name() + " " + value;
    if (auto kind = sourceKinds_.find(option); kind != sourceKinds_.end()) {
      options_.sources.push_back({kind->second, value, library, plugin});
      unapplied.clear();
    }
    std::pair<std::string, std::string> assignment;
    if (option == libraryAssignmentOption_ && SplitAssignment(value, assignment)) {
      options_.sources.push_back({SourceArgument::Kind::kFile, assignment.second, assignment.first, plugin});
    } else if (option == libraryAssignmentOption_ && error.empty()) {
      error = "--lib needs NAME=PATH, not '" + value + "'";
    }
  });
  if (!error.empty()) return Options::Outcome::kUsageError;
  if (!unapplied.empty()) {
    error = unapplied + " applies to no source: give it before the sources it is for";
    return Options::Outcome::kUsageError;
  }
  if (!TakePositionals(positionals_, error)) return Options::Outcome::kUsageError;

  for (const std::string& property : properties_) {
    std::pair<std::string, std::string> assignment;
    if (!SplitAssignment(property, assignment)) {
      error = "--property needs KEY=VALUE, not '" + property + "'";
      return Options::Outcome::kUsageError;
    }
    options_.properties.push_back(assignment);
  }
  for (const std::string& define : options_.defines) {
    if (define.empty() || define[0] == '=') {
      error = "-D needs NAME[=VALUE], not '" + define + "'";
      return Options::Outcome::kUsageError;
    }
    if (!Options::FitsList(define)) {
      error = "-D '" + define + "' holds a ';', which would separate it into more than one macro";
      return Options::Outcome::kUsageError;
    }
  }
  for (const std::string& directory : options_.includeDirs) {
    if (!Options::FitsList(directory)) {
      error = "-I '" + directory + "' holds a ';', which would separate it into more than one directory";
      return Options::Outcome::kUsageError;
    }
  }
  options_.format = format_ == "json" ? Format::kJson : format_ == "dot" ? Format::kDot : Format::kText;
  options_.top = unit_.empty() ? top_ : unit_;
  options_.byUnit = !unit_.empty();
  return CheckCombination(error) ? Options::Outcome::kRun : Options::Outcome::kUsageError;
}

// The walk above took every positional as a source; the first one (and the UNIT of `ports`) are
// not.
bool Parser::TakePositionals(const std::vector<std::string>& positionals, std::string& error) {
  if (positionals.empty()) {
    error = "no command given";
    return false;
  }
  auto command = CommandNames().find(positionals[0]);
  if (command == CommandNames().end()) {
    error = "unknown command '" + positionals[0] + "'";
    return false;
  }
  options_.command = command->second;
  std::size_t notSources = 1;
  if (options_.command == Command::kPorts) {
    if (positionals.size() < 2) {
      error = "ports needs a UNIT";
      return false;
    }
    options_.unit = positionals[1];
    notSources = 2;
  }
  std::vector<SourceArgument>& sources = options_.sources;
  std::size_t skipped = 0;
  for (auto it = sources.begin(); it != sources.end() && skipped < notSources;) {
    if (it->kind == SourceArgument::Kind::kFile) {
      it = sources.erase(it);
      ++skipped;
    } else {
      ++it;
    }
  }
  return true;
}

bool Parser::CheckCombination(std::string& error) const {
  const Options& o = options_;
  if (!top_.empty() && !unit_.empty()) {
    error = "--top and --unit exclude each other";
    return false;
  }
  if (o.byUnit && o.command != Command::kOrder && o.command != Command::kExport) {
    error = "--unit applies to the order and export commands only";
    return false;
  }
  if (o.withLibrary && o.command != Command::kOrder) {
    error = "--with-library applies to the order command only";
    return false;
  }
  if (!o.top.empty() && o.command != Command::kOrder && o.command != Command::kTree &&
      o.command != Command::kExport) {
    error = "--top applies to the tree, order and export commands only";
    return false;
  }
  if ((o.depth || o.instancesOnly) && o.command != Command::kTree) {
    error = "--depth and --instances apply to the tree command only";
    return false;
  }
  if (o.exportTo.empty() != (o.command != Command::kExport)) {
    error = "export needs --to FORMAT, and --to applies to export only";
    return false;
  }
  if (o.format == Format::kDot && o.command != Command::kTree && o.command != Command::kOrder) {
    error = "--format dot applies to the tree and order commands only";
    return false;
  }
  if (o.sources.empty() && o.command != Command::kFactories) {
    error = "no sources given (files, -P FILE or -f FILE)";
    return false;
  }
  return true;
}

}  // namespace

Options::Outcome Options::Parse(int argc, const char* const* argv, Options& options, std::string& error) {
  return Parser(options).Run(argc, argv, error);
}

}  // namespace quillon
