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
    "  watch        keep reading the sources and print the view (--show order|tree|check) when it changes\n"
    "\n"
    "sources:\n"
    "  SOURCE                a source file; the plug-in follows from its extension\n"
    "  -P, --project FILE    a project file (JSON); its paths are relative to it\n"
    "  -f FILE               a list of sources, one a line, with +incdir+ and +define+\n"
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
    "cache:\n"
    "  --cache DIR           keep parse results in DIR (default with -P: .quillon beside the project)\n"
    "  --no-cache            parse every file\n"
    "\n"
    "output:\n"
    "  --format text|json|dot, -o FILE, -q (no messages), -v (developer texts too)\n"
    "\n"
    "A UNIT is a design-unit key (Entity|cpu, Architecture|cpu|rtl, Module|top) or a name.\n"
    "Exit status: 0 done, 1 the operation failed or an error was reported, 2 bad usage or input.\n";

const std::map<std::string, Command>& CommandNames() {
  static const std::map<std::string, Command> names = {
      {"units", Command::kUnits}, {"tree", Command::kTree},   {"order", Command::kOrder},
      {"ports", Command::kPorts}, {"check", Command::kCheck}, {"factories", Command::kFactories},
      {"watch", Command::kWatch}};
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
  std::string top_, unit_, format_ = "text", show_ = "order";
  CLI::Option* positionalOption_ = nullptr;
  CLI::Option* projectOption_ = nullptr;
  CLI::Option* listOption_ = nullptr;
  CLI::Option* libraryOption_ = nullptr;
  CLI::Option* pluginOption_ = nullptr;
};

void Parser::Declare() {
  app_.set_help_flag();
  app_.add_flag("-h,--help", help_);
  positionalOption_ = app_.add_option("args", positionals_);
  projectOption_ = AddRepeated(app_, "-P,--project", projects_);
  listOption_ = AddRepeated(app_, "-f", lists_);
  libraryOption_ = AddRepeated(app_, "-l,--library", libraries_);
  pluginOption_ = AddRepeated(app_, "--plugin", plugins_);
  AddRepeated(app_, "-D", options_.defines);
  AddRepeated(app_, "-I", options_.includeDirs);
  app_.add_option("--target", options_.target);
  app_.add_option("--family", options_.family);
  AddRepeated(app_, "--property", properties_);
  app_.add_option("--converter-timeout", options_.converterTimeout)->check(CLI::NonNegativeNumber);
  app_.add_option("--top", top_);
  app_.add_option("--unit", unit_);
  app_.add_flag("--with-library", options_.withLibrary);
  app_.add_option("--format", format_)->check(CLI::IsMember({"text", "json", "dot"}));
  app_.add_option("-o", options_.outputPath);
  app_.add_flag("-q", options_.quiet);
  app_.add_flag("-v", options_.verbose);
  AddRepeated(app_, "--external-library", options_.externalLibraries);
  app_.add_flag("--strict", options_.strict);
  app_.add_flag("--warnings-as-errors", options_.warningsAsErrors);
  app_.add_option("--cache", options_.cacheDir);
  app_.add_flag("--no-cache", options_.noCache);
  app_.add_option("--show", show_)->check(CLI::IsMember({"order", "tree", "check"}));
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
  ArgumentWalk(app_).ForEach([&](const CLI::Option* option, const std::string& value) {
    using Kind = SourceArgument::Kind;
    if (option == libraryOption_) library = value;
    if (option == pluginOption_) plugin = value;
    if (option == positionalOption_) options_.sources.push_back({Kind::kFile, value, library, plugin});
    if (option == projectOption_) options_.sources.push_back({Kind::kProjectFile, value, library, plugin});
    if (option == listOption_) options_.sources.push_back({Kind::kFileList, value, library, plugin});
  });
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
  options_.watchView = show_ == "tree"    ? Command::kTree
                       : show_ == "check" ? Command::kCheck
                                          : Command::kOrder;
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
  if ((!o.top.empty() || o.withLibrary) && o.command != Command::kOrder) {
    error = "--top, --unit and --with-library apply to the order command only";
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
