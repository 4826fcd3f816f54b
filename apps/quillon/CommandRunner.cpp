#include "CommandRunner.h"

#include <sys/stat.h>

#include <algorithm>
#include <cctype>
#include <cinttypes>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <optional>

#include "ArchitectureCheck.h"
#include "DiagnosticFinder.h"
#include "DiagnosticReport.h"
#include "DotOutput.h"
#include "ExitStatus.h"
#include "FileGraph.h"
#include "Host/HostComponents.h"
#include "IName.h"
#include "JsonOutput.h"
#include "ModuleLoader.h"
#include "OutputFile.h"
#include "ParseCache.h"
#include "Port/Env.h"
#include "Port/File.h"
#include "Port/FileName.h"
#include "Port/MsgManData.h"
#include "ProjectBuilder.h"
#include "ProjectLoader.h"
#include "RavA/Factory.h"
#include "TextOutput.h"
#include "TreeReader.h"
#include "UnitFinder.h"
#include "Watcher.h"

namespace quillon {

namespace {

// What getCompileOrderByDU answers for a unit kind that has no order of its own, and for a unit
// that is not in the hierarchy.
constexpr CitI::Result kNoOrderForKind = 4;
constexpr CitI::Result kNotInHierarchy = 5;

constexpr const char* kCutOrder =
    "no valid compile order exists: the files of the cycles listed above use each other, and the order "
    "breaks those dependencies";

bool HasCode(const std::vector<Diagnostic>& diagnostics, std::string_view code) {
  return std::any_of(diagnostics.begin(), diagnostics.end(),
                     [&](const Diagnostic& d) { return d.code == code; });
}

std::string ResultText(CitI::Result result) {
  char text[32];
  if (result >= -1 && result <= 0xFFFF) {
    std::snprintf(text, sizeof text, "%" PRId64, result);
  } else {
    std::snprintf(text, sizeof text, "0x%" PRIX64, static_cast<std::uint64_t>(result));
  }
  return text;
}

std::string KeyOf(Vad::IHdlDesignUnit* unit) {
  Port::StringBase key;
  if (auto* name = Prjrep::QueryAs<Prjrep::IName>(unit)) name->GetName(&key);
  return key.str();
}

// Every file the run reads: the sources and the project files and lists that named them.
std::vector<std::string> InputPaths(const ProjectSources& sources, const Options& options) {
  std::vector<std::string> paths;
  for (const SourceFile& file : sources.files) paths.push_back(file.path);
  for (const SourceArgument& argument : options.sources) paths.push_back(argument.path);
  return paths;
}

// Keeps the module's developer texts of one query, passing them on as well. The module gives the
// reason for a missing port list as a developer text ("ports of KEY: reason").
class DeveloperTextCapture {
 public:
  DeveloperTextCapture()
      : previous_(Port_MsgManData::setDebugSink([this](std::string_view text) {
          text_.append(text);
          if (previous_) previous_(text);
        })) {}
  ~DeveloperTextCapture() { Port_MsgManData::setDebugSink(std::move(previous_)); }
  DeveloperTextCapture(const DeveloperTextCapture&) = delete;
  DeveloperTextCapture& operator=(const DeveloperTextCapture&) = delete;

  // The last line that starts with `lead`, without its line end; empty when there is none.
  std::string LastLineStartingWith(const std::string& lead) const {
    std::string found;
    for (std::size_t start = 0; start < text_.size();) {
      std::size_t end = text_.find('\n', start);
      if (end == std::string::npos) end = text_.size();
      if (text_.compare(start, lead.size(), lead) == 0) found = text_.substr(start, end - start);
      start = end + 1;
    }
    return found;
  }

 private:
  std::string text_;
  Port_MsgManData::DebugSink previous_;
};

}  // namespace

int CommandRunner::Run() {
  if (options_.command == Command::kFactories) return ListFactories();
  if (options_.command == Command::kWatch) return Watcher(options_).Run();
  MessageLog log(options_.quiet, options_.verbose);
  log_ = &log;
  int status = RunOnProject();
  log_ = nullptr;
  return status;
}

int CommandRunner::BadInput(const std::string& text) {
  std::fprintf(stderr, "quillon: %s\n", text.c_str());
  return kExitBadInput;
}

int CommandRunner::Failed(const std::string& what, CitI::Result result) {
  log_->ReportError(what + " (the module answered " + ResultText(result) + ")");
  return kExitFailed;
}

int CommandRunner::Finished() const { return log_->HasErrors() ? kExitFailed : kExitDone; }

int CommandRunner::ListFactories() {
  ModuleLoader module;
  std::string error;
  if (!module.Load(error)) {
    std::fprintf(stderr, "quillon: %s\n", error.c_str());
    return kExitFailed;
  }
  std::printf("module %s registers %zu classes:\n", module.path().c_str(),
              RavA::Factory::RegisteredClasses().size());
  for (const Port::XUID& id : RavA::Factory::RegisteredClasses())
    std::printf("  %s\n", id.ToString().c_str());
  return kExitDone;
}

void CommandRunner::TakeExternalLibraries(const ProjectSources& sources) {
  externalLibraries_ = sources.externalLibraries;
  externalLibraries_.insert(externalLibraries_.end(), options_.externalLibraries.begin(),
                            options_.externalLibraries.end());
}

int CommandRunner::RunOn(Vad::IHdlProject* project, const ProjectSources& sources, std::ostream& out) {
  MessageLog log(options_.quiet, options_.verbose);
  log_ = &log;
  TakeExternalLibraries(sources);
  int status = RunCommand(project, sources.files.size(), out);
  log_ = nullptr;
  return status;
}

int CommandRunner::RunOnProject() {
  ProjectSources sources;
  std::string error;
  if (!ProjectLoader(sources).Load(options_, error)) return BadInput(error);
  TakeExternalLibraries(sources);

  OutputFile file;
  const bool toFile = !options_.outputPath.empty();
  if (toFile) {
    if (OutputFile::IsOneOf(options_.outputPath, InputPaths(sources, options_))) {
      return BadInput("the output file " + options_.outputPath + " is also an input");
    }
    if (!file.Open(options_.outputPath, error)) return BadInput(error);
  }
  std::ostream& out = toFile ? file.stream() : std::cout;

  ModuleLoader module;
  if (!Host::RegisterHostComponents() || !module.Load(error)) {
    log_->ReportError(error.empty() ? "the host components cannot be registered" : error);
    return kExitFailed;
  }
  for (const std::string& warning : sources.warnings) log_->ReportWarning(warning);
  cacheInputs_ = CacheInputs(sources, module.path());
  ProjectBuilder::SetInstallRootWhenUnset();
  ProjectBuilder builder;
  if (!builder.Build(sources, error)) {
    log_->ReportError(error);
    return kExitFailed;
  }
  int status = RunCommand(builder.project(), sources.files.size(), out);
  out.flush();
  if (!out) {
    log_->ReportError("the output could not be written");
    return kExitFailed;
  }
  if (toFile && status == kExitDone && !file.Commit(error)) {
    log_->ReportError(error);
    return kExitFailed;
  }
  return status;
}

int CommandRunner::RunCommand(Vad::IHdlProject* project, std::size_t fileCount, std::ostream& out) {
  Progress progress(options_.quiet, fileCount);
  log_->SetProgress(&progress);
  int status = ParseAndRun(project, fileCount, progress, out);
  log_->SetProgress(nullptr);
  return status;
}

int CommandRunner::ParseAndRun(Vad::IHdlProject* project, std::size_t fileCount, Progress& progress,
                               std::ostream& out) {
  ProjectReader reader(project, progress);
  std::optional<ParseCache> cache;
  if (std::string directory = CacheDirectory(); !directory.empty())
    cache.emplace(directory, cacheInputs_, *log_);
  CitI::Result parsed = reader.Parse(cache ? &*cache : nullptr);
  if (cache) {
    Port_MsgManData::debugStub("parse cache %s: %zu files loaded, %zu parsed\n", CacheDirectory().c_str(),
                               cache->hits(), cache->misses());
  }
  if (CitI::Result result = parsed; result != CitI::kOk) {
    int status = Failed("the sources could not be read", result);
    if (options_.format == Format::kJson) JsonOutput::Messages(log_->messages(), out);
    return status;
  }
  switch (options_.command) {
    case Command::kUnits:
      return Units(reader, out);
    case Command::kTree:
      return Tree(reader, project, out);
    case Command::kOrder:
      return Order(reader, project, out);
    case Command::kPorts:
      return Ports(reader, out);
    case Command::kCheck:
      return Check(reader, project, fileCount, out);
    case Command::kFactories:
    case Command::kWatch:
      break;
  }
  return kExitFailed;
}

int CommandRunner::Units(ProjectReader& reader, std::ostream& out) {
  std::vector<FileInfo> files = reader.Files();
  if (options_.format == Format::kJson) {
    JsonOutput::Units(files, log_->messages(), out);
  } else {
    TextOutput::Units(files, out);
  }
  return Finished();
}

int CommandRunner::Tree(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out) {
  TreeInfo tree;
  bool json = options_.format == Format::kJson;
  CitI::Result result = TreeReader::Read(project, tree, json);
  int status = result == CitI::kOk ? Finished() : Failed("the design hierarchy is not available", result);
  bool built = result == CitI::kOk;
  // The order is not asked for: its cycle messages belong to the order command.
  std::vector<Diagnostic> diagnostics = DiagnosticReport::AsWarnings(Diagnose(reader, project, nullptr));
  ShowDiagnostics(diagnostics);
  if (json) {
    JsonOutput::Tree(built ? &tree : nullptr, log_->messages(), out, diagnostics);
  } else if (built && options_.format == Format::kDot) {
    DotOutput::Tree(tree, out);
  } else if (built) {
    TextOutput::Tree(tree, out);
  }
  return status;
}

int CommandRunner::Order(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out) {
  std::vector<OrderEntry> order;
  CitI::Result result;
  if (options_.top.empty()) {
    result = reader.Order(order);
  } else {
    Vad::IHdlDesignUnit* unit = UnitFinder(reader.designUnits()).Find(options_.top);
    if (!unit) return BadInput("unknown design unit '" + options_.top + "'");
    result = reader.OrderOf(unit, options_.byUnit, order);
  }
  bool ordered = result == CitI::kOk;
  if (ordered && log_->OrderWasCut()) log_->ReportError(kCutOrder);
  int status = Finished();
  if (result == kNoOrderForKind) {
    status = Failed("a compile order of a single unit is given for entities, architectures and modules only",
                    result);
  } else if (result == kNotInHierarchy) {
    status = Failed("'" + options_.top + "' has no place in the design hierarchy", result);
  } else if (!ordered) {
    status = Failed("the compile order is not available", result);
  }

  std::vector<Diagnostic> diagnostics =
      DiagnosticReport::AsWarnings(Diagnose(reader, project, ordered ? &order : nullptr));
  ShowDiagnostics(diagnostics);
  if (options_.format == Format::kJson) {
    JsonOutput::Order(ordered ? &order : nullptr, log_->messages(), out, diagnostics);
  } else if (ordered && options_.format == Format::kDot) {
    TreeInfo tree;
    TreeReader::Read(project, tree, false);
    DotOutput::Order(FileGraph::Build(tree, order), out);
  } else if (ordered) {
    TextOutput::Order(order, options_.withLibrary, out);
  }
  return status;
}

// The module explains a failed extraction in its own messages; a unit whose kind of source has
// no port extraction gets no answer and no message, so quillon says so itself.
int CommandRunner::Ports(ProjectReader& reader, std::ostream& out) {
  Vad::IHdlDesignUnit* unit = UnitFinder(reader.designUnits()).Find(options_.unit);
  if (!unit) return BadInput("unknown design unit '" + options_.unit + "'");
  std::string key = KeyOf(unit);
  std::optional<std::vector<PortInfo>> ports;
  std::string reason;
  CitI::Result result;
  {
    DeveloperTextCapture developerTexts;
    result = reader.PortsOf(unit, ports);
    reason = developerTexts.LastLineStartingWith("ports of " + key + ": ");
  }
  int status = Finished();
  if (result != CitI::kOk) {
    status = Failed("the ports of " + key + " are not available", result);
  } else if (!ports) {
    log_->ReportError(!reason.empty()
                          ? reason
                          : "the ports of " + key +
                                " are not available: ports are extracted from VHDL and Verilog only");
    status = kExitFailed;
  }
  if (options_.format == Format::kJson) {
    JsonOutput::Ports(key, ports ? &*ports : nullptr, log_->messages(), out);
  } else if (ports) {
    TextOutput::Ports(*ports, out);
  }
  return status;
}

// A design with any error diagnostic fails, and with --warnings-as-errors one with any warning.
int CommandRunner::Check(ProjectReader& reader, Vad::IHdlProject* project, std::size_t fileCount,
                         std::ostream& out) {
  std::vector<OrderEntry> order;
  CitI::Result result = reader.Order(order);
  int status = result == CitI::kOk ? Finished() : Failed("the compile order is not available", result);
  std::vector<Diagnostic> diagnostics = Diagnose(reader, project, result == CitI::kOk ? &order : nullptr);
  if (result == CitI::kOk) {
    for (Diagnostic& ambiguous : ArchitectureCheck::Find(reader.Files(), order))
      diagnostics.push_back(std::move(ambiguous));
    if (log_->OrderWasCut() && !HasCode(diagnostics, DiagnosticCode::kNoValidOrder))
      diagnostics.push_back({Diagnostic::Severity::kError, DiagnosticCode::kNoValidOrder, kCutOrder, "", 0});
  }
  ShowDiagnostics(diagnostics);
  std::size_t errors = DiagnosticReport::Count(diagnostics, Diagnostic::Severity::kError);
  std::size_t warnings = DiagnosticReport::Count(diagnostics, Diagnostic::Severity::kWarning);
  if (errors > 0 || (options_.warningsAsErrors && (warnings > 0 || log_->getWarnCount() > 0)))
    status = kExitFailed;
  std::size_t units = reader.designUnits() ? reader.designUnits()->GetCount() : 0;
  if (options_.format == Format::kJson) {
    JsonOutput::Check(fileCount, units, log_->messages(), diagnostics, out);
  } else {
    TextOutput::CheckSummary(fileCount, units, log_->getErrCount() + static_cast<int>(errors),
                             log_->getWarnCount() + static_cast<int>(warnings), out);
  }
  return status;
}

std::string CommandRunner::CacheDirectory() const {
  if (options_.noCache) return {};
  if (!options_.cacheDir.empty()) return options_.cacheDir;
  for (const SourceArgument& argument : options_.sources) {
    if (argument.kind != SourceArgument::Kind::kProjectFile) continue;
    std::string head = Port::FileName::GetHead(argument.path).str();
    return (head.empty() ? std::string(".") : head) + "/.quillon";
  }
  return {};
}

std::string CommandRunner::CacheInputs(const ProjectSources& sources, const std::string& modulePath) {
  std::string inputs;
  for (const auto& [name, value] : sources.properties) inputs += name + '=' + value + '\n';
  const char* cells = Port_Env::GetEnv("CORVANE");
  inputs += std::string("CORVANE=") + (cells ? cells : "") + '\n';
  Port::StringBase directory;
  Port::File::getcwd(&directory);
  inputs += "cwd=" + directory.str() + '\n';
  struct stat module {};
  if (::stat(modulePath.c_str(), &module) == 0) {
    inputs += "module=" + modulePath + ' ' + std::to_string(module.st_size) + ' ' +
              std::to_string(module.st_mtim.tv_sec) + '.' + std::to_string(module.st_mtim.tv_nsec) + '\n';
  }
  return inputs;
}

std::vector<Diagnostic> CommandRunner::Diagnose(ProjectReader& reader, Vad::IHdlProject* project,
                                                const std::vector<OrderEntry>* order) const {
  DiagnosticFinder::Settings settings;
  for (const std::string& library : externalLibraries_) {
    std::string lower = library;
    for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    settings.externalLibraries.insert(lower);
  }
  settings.strict = options_.strict;
  TreeInfo tree;
  bool built = TreeReader::Read(project, tree, false) == CitI::kOk;
  return DiagnosticFinder(std::move(settings)).Find(reader.Files(), built ? &tree : nullptr, order);
}

void CommandRunner::ShowDiagnostics(const std::vector<Diagnostic>& diagnostics) const {
  if (!options_.quiet) DiagnosticReport::Write(diagnostics, std::cerr);
}

}  // namespace quillon
