#include "Options.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <charconv>
#include <cstdio>
#include <deque>
#include <iostream>

#include "ManPage.h"
#include "OptionTable.h"
#include "Suggestions.h"

namespace quillon {

namespace {

constexpr const char* kDescription =
    "quillon reads HDL sources, finds their design units, builds the design hierarchy and computes the "
    "order in which the files must be compiled.";
constexpr const char* kCommandHelp = "Run 'quillon COMMAND --help' for the options of a command.";

bool IsWholeNumber(const std::string& text) {
  unsigned number = 0;
  auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), number);
  return !text.empty() && failure == std::errc() && end == text.data() + text.size();
}

// The values of options with choices or numbers are checked here rather than by CLI11, which does
// not name an option declared hidden in its message.
bool CheckValue(const OptionEntry& option, const std::string& value, std::string& error) {
  const std::string name = OptionTable::Spellings(option).back();
  if (option.number && !IsWholeNumber(value)) {
    error = name + ": '" + value + "' is not a whole number that quillon can count";
    return false;
  }
  const std::vector<std::string>& choices = option.choices;
  if (choices.empty() || std::find(choices.begin(), choices.end(), value) != choices.end()) return true;
  error = name + ": '" + value + "' is not one of";
  for (const std::string& choice : choices) error += " " + choice;
  return false;
}

// CLI11 would show the command as an optional subcommand and the hidden catch of misspelt
// commands as "[...]".
class HelpFormatter : public CLI::Formatter {
 public:
  std::string make_usage(const CLI::App* app, std::string name) const override {
    if (app->get_parent()) return CLI::Formatter::make_usage(app, std::move(name));
    return get_label("Usage") + ": " + name + " [OPTIONS] COMMAND [OPTIONS] [SOURCE...]\n";
  }
};

bool SplitAssignment(const std::string& text, std::pair<std::string, std::string>& out) {
  std::size_t equals = text.find('=');
  if (equals == 0 || equals == std::string::npos) return false;
  out = {text.substr(0, equals), text.substr(equals + 1)};
  return true;
}

std::string UnknownCommand(const std::string& word) {
  std::vector<std::string> names{"help"};
  for (const CommandEntry& command : OptionTable::Commands()) names.push_back(command.name);
  return "unknown command '" + word + "'" + Suggestions::DidYouMean(word, names);
}

bool AppliesTo(const OptionEntry& option, Command command) { return (option.commands & SetOf(command)) != 0; }

// Options are recorded as they are parsed, with the number of sources before them, so that -l and --plugin
// apply to the sources after them whether they stand before or after the command. CLI11 runs the callbacks of
// parent and command in one pass over the arguments.
class Parser {
 public:
  explicit Parser(Options& options) : values_(options) {}

  Options::Outcome Run(int argc, const char* const* argv, std::string& error);

 private:
  struct Occurrence {
    const OptionEntry* option;
    std::string value;
    std::size_t sourcesBefore;
  };
  struct CommandApp {
    const CommandEntry* entry;
    CLI::App* app;
    std::string unit;
    std::vector<std::string> sources;
    CLI::Option* sourcesOption;
  };

  void Declare();
  void DeclareOption(CLI::App& app, const OptionEntry& option, bool shown);
  void DeclareCommand(const CommandEntry& command);
  std::size_t SourcesSoFar() const;
  const CommandApp* SelectedCommand() const;

  bool ShowHelpTopic() const;
  void ShowCompletionWords(const std::string& of) const;
  bool TakeWords(std::string& error);
  bool Take(const Occurrence& occurrence, std::string& error);
  bool TakeOccurrences(const CommandApp& command, std::string& error);
  bool CheckValues(std::string& error);
  bool CheckCombination(std::string& error) const;

  CLI::App app_{kDescription, "quillon"};
  OptionValues values_;
  std::vector<Occurrence> occurrences_;
  std::deque<CommandApp> commands_;  // stable addresses for the callbacks
  std::vector<std::string> strayWords_;
  CLI::App* help_ = nullptr;
  std::vector<std::string> helpTopic_;
};

void Parser::DeclareOption(CLI::App& app, const OptionEntry& option, bool shown) {
  auto record = [this, &option](const std::string& value) {
    occurrences_.push_back({&option, value, SourcesSoFar()});
  };
  CLI::Option* declared;
  if (option.value) {
    declared = app.add_option_function<std::string>(option.names, record, option.help)
                   ->type_name(option.value)
                   ->allow_extra_args(false);
  } else {
    declared = app.add_flag_callback(
        option.names, [record] { record(""); }, option.help);
  }
  declared->trigger_on_parse()->group(shown ? option.group : "");
}

void Parser::DeclareCommand(const CommandEntry& entry) {
  CLI::App* app = app_.add_subcommand(entry.name, entry.summary)->group("Commands");
  CommandApp& command = commands_.emplace_back(CommandApp{&entry, app, {}, {}, nullptr});
  if (*entry.operands) app->add_option(entry.operands, command.unit, "the design unit")->type_name("");
  command.sourcesOption =
      app->add_option("SOURCE", command.sources, "a source file; the plug-in follows from its extension")
          ->type_name("");
  bool namesUnits = std::string_view(entry.operands) == "UNIT";
  for (const OptionEntry& option : OptionTable::All()) {
    if (!AppliesTo(option, entry.command)) continue;
    DeclareOption(*app, option, true);
    namesUnits = namesUnits || (option.value && std::string_view(option.value) == "UNIT");
  }
  app->footer(namesUnits ? std::string(OptionTable::UnitText()) + "\n" + OptionTable::ExitText()
                         : OptionTable::ExitText());
}

// Every option is also declared, hidden, on quillon itself, so that it may stand before the
// command as well (or follow a command it does not apply to, as before: CheckCombination refuses
// those that make no sense there, the others are ignored).
void Parser::Declare() {
  app_.formatter(std::make_shared<HelpFormatter>());
  app_.require_subcommand(0, 1);
  app_.fallthrough();
  app_.allow_extras();
  app_.footer(std::string(kCommandHelp) + "\n" + OptionTable::ExitText());
  app_.add_option("COMMAND", strayWords_)->group("");
  for (const OptionEntry& option : OptionTable::All()) DeclareOption(app_, option, option.commands == 0);
  for (const CommandEntry& command : OptionTable::Commands()) DeclareCommand(command);
  help_ =
      app_.add_subcommand("help", "this help, or with a COMMAND the help of that command")->group("Commands");
  help_->add_option("COMMAND", helpTopic_);
}

std::size_t Parser::SourcesSoFar() const {
  std::size_t count = 0;
  for (const CommandApp& command : commands_) count += command.sourcesOption->results().size();
  return count;
}

const Parser::CommandApp* Parser::SelectedCommand() const {
  for (const CommandApp& command : commands_) {
    if (command.app->parsed()) return &command;
  }
  return nullptr;
}

Options::Outcome Parser::Run(int argc, const char* const* argv, std::string& error) {
  Declare();
  try {
    app_.parse(argc, argv);
  } catch (const CLI::CallForHelp&) {
    std::cout << app_.help();
    return Options::Outcome::kHelpShown;
  } catch (const CLI::ParseError& failure) {
    error = failure.what();
    return Options::Outcome::kUsageError;
  }
  for (const Occurrence& occurrence : occurrences_) {
    if (occurrence.option->commands == 0 && !Take(occurrence, error)) return Options::Outcome::kUsageError;
  }
  if (values_.manPageAsked) {
    ManPage::Write(std::cout);
    return Options::Outcome::kHelpShown;
  }
  if (values_.completionWordsOf) {
    ShowCompletionWords(*values_.completionWordsOf);
    return Options::Outcome::kHelpShown;
  }
  if (values_.versionAsked) return Options::Outcome::kVersionAsked;
  if (!TakeWords(error)) return Options::Outcome::kUsageError;
  if (help_->parsed()) {
    if (ShowHelpTopic()) return Options::Outcome::kHelpShown;
    error = UnknownCommand(helpTopic_[0]);
    return Options::Outcome::kUsageError;
  }
  const CommandApp* command = SelectedCommand();
  if (!command) {
    error = "no command given";
    return Options::Outcome::kUsageError;
  }
  values_.options.command = command->entry->command;
  if (command->entry->command == Command::kPorts && command->unit.empty()) {
    error = "ports needs a UNIT";
    return Options::Outcome::kUsageError;
  }
  values_.options.unit = command->unit;
  if (!TakeOccurrences(*command, error)) return Options::Outcome::kUsageError;
  if (!CheckValues(error)) return Options::Outcome::kUsageError;
  return CheckCombination(error) ? Options::Outcome::kRun : Options::Outcome::kUsageError;
}

// CLI11 would give the help of the selected command, which is `help` itself.
bool Parser::ShowHelpTopic() const {
  if (helpTopic_.empty()) {
    std::cout << app_.get_formatter()->make_help(&app_, app_.get_name(), CLI::AppFormatMode::Normal);
    return true;
  }
  for (const CommandApp& command : commands_) {
    if (command.entry->name != helpTopic_[0]) continue;
    std::cout << command.app->help(app_.get_name());
    return true;
  }
  return false;
}

// `of` is "commands", "options" (those of quillon itself), a command, or an option whose values
// are wanted.
void Parser::ShowCompletionWords(const std::string& of) const {
  std::vector<std::string> words;
  const CommandApp* command = nullptr;
  for (const CommandApp& each : commands_) {
    if (of == "commands") words.push_back(each.entry->name);
    if (each.entry->name == of) command = &each;
  }
  if (of == "commands") words.push_back("help");
  if (command || of == "options") words.insert(words.end(), {"-h", "--help"});
  for (const OptionEntry& option : OptionTable::All()) {
    std::vector<std::string> spellings = OptionTable::Spellings(option);
    if (std::find(spellings.begin(), spellings.end(), of) != spellings.end())
      words.insert(words.end(), option.choices.begin(), option.choices.end());
    bool offered = option.commands == 0 ? command || of == "options"
                                        : command && AppliesTo(option, command->entry->command);
    if (offered && *option.group) words.insert(words.end(), spellings.begin(), spellings.end());
  }
  for (const std::string& word : words) std::cout << word << '\n';
}

// Words that no command or option took: a misspelt command or option, or an argument too many.
bool Parser::TakeWords(std::string& error) {
  if (!strayWords_.empty()) {
    error = UnknownCommand(strayWords_[0]);
    return false;
  }
  std::vector<std::string> remaining = app_.remaining(true);
  if (remaining.empty()) return true;
  const std::string& word = remaining[0];
  if (word.size() < 2 || word[0] != '-') {
    error = "unexpected argument '" + word + "'";
    return false;
  }
  std::vector<std::string> optionNames{"--help"};
  for (const OptionEntry& option : OptionTable::All()) {
    if (!*option.group) continue;
    for (const std::string& spelling : OptionTable::Spellings(option))
      if (spelling.size() > 2) optionNames.push_back(spelling);
  }
  std::string name = word.substr(0, word.find('='));
  error = "unknown option '" + name + "'" + Suggestions::DidYouMean(name, optionNames);
  return false;
}

// The sources of the command interleaved with the options, in command-line order.
bool Parser::Take(const Occurrence& occurrence, std::string& error) {
  if (!CheckValue(*occurrence.option, occurrence.value, error)) return false;
  occurrence.option->take(values_, occurrence.value);
  return true;
}

bool Parser::TakeOccurrences(const CommandApp& command, std::string& error) {
  std::size_t taken = 0;
  auto takeSourcesUpTo = [&](std::size_t end) {
    for (; taken < end && taken < command.sources.size(); ++taken) {
      values_.options.sources.push_back(
          {SourceArgument::Kind::kFile, command.sources[taken], values_.library, values_.plugin});
      values_.unapplied.clear();
    }
  };
  for (const Occurrence& occurrence : occurrences_) {
    takeSourcesUpTo(occurrence.sourcesBefore);
    if (occurrence.option->commands != 0 && !Take(occurrence, error)) return false;
  }
  takeSourcesUpTo(command.sources.size());
  if (!values_.error.empty()) {
    error = values_.error;
    return false;
  }
  if (!values_.unapplied.empty()) {
    error = values_.unapplied + " applies to no source: give it before the sources it is for";
    return false;
  }
  return true;
}

bool Parser::CheckValues(std::string& error) {
  Options& options = values_.options;
  for (const std::string& property : values_.properties) {
    std::pair<std::string, std::string> assignment;
    if (!SplitAssignment(property, assignment)) {
      error = "--property needs KEY=VALUE, not '" + property + "'";
      return false;
    }
    options.properties.push_back(assignment);
  }
  for (const std::string& define : options.defines) {
    if (define.empty() || define[0] == '=') {
      error = "-D needs NAME[=VALUE], not '" + define + "'";
      return false;
    }
    if (!Options::FitsList(define)) {
      error = "-D '" + define + "' holds a ';', which would separate it into more than one macro";
      return false;
    }
  }
  for (const std::string& directory : options.includeDirs) {
    if (!Options::FitsList(directory)) {
      error = "-I '" + directory + "' holds a ';', which would separate it into more than one directory";
      return false;
    }
  }
  const std::string& format = values_.format;
  options.format = format == "json" ? Format::kJson : format == "dot" ? Format::kDot : Format::kText;
  options.color = values_.color == "always"  ? ColorMode::kAlways
                  : values_.color == "never" ? ColorMode::kNever
                                             : ColorMode::kAuto;
  options.watchView = values_.show == "tree"    ? Command::kTree
                      : values_.show == "check" ? Command::kCheck
                                                : Command::kOrder;
  options.top = values_.unit.empty() ? values_.top : values_.unit;
  options.byUnit = !values_.unit.empty();
  return true;
}

bool Parser::CheckCombination(std::string& error) const {
  const Options& o = values_.options;
  if (!values_.top.empty() && !values_.unit.empty()) {
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
