#include "CommandRunner.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cinttypes>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <optional>
#include <sstream>

#include "ArchitectureCheck.h"
#include "DeveloperTextCapture.h"
#include "DiagnosticFinder.h"
#include "DiagnosticReport.h"
#include "DotOutput.h"
#include "ExitStatus.h"
#include "ExportPlanner.h"
#include "ExportWriter.h"
#include "FileFacts.h"
#include "FileGraph.h"
#include "Host/HostComponents.h"
#include "IHdlElement.h"
#include "IName.h"
#include "InputStamp.h"
#include "JsonOutput.h"
#include "LibraryResolver.h"
#include "ModuleLoader.h"
#include "OutputCapture.h"
#include "OutputFile.h"
#include "ParseCache.h"
#include "Port/Env.h"
#include "Port/File.h"
#include "Port/FileName.h"
#include "Port/MsgManData.h"
#include "ProjectBuilder.h"
#include "ProjectLoader.h"
#include "RavA/Factory.h"
#include "ResultCache.h"
#include "SourceFileCheck.h"
#include "TerminalColor.h"
#include "TextOutput.h"
#include "TreeReader.h"
#include "TreeView.h"
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

// The path of the unit's file; empty when it cannot say.
std::string FileOf(Vad::IHdlDesignUnit* unit) {
  Prjrep::AutoRelease<Vad::IHdlFile> file;
  auto* element = Prjrep::QueryAs<Vad::IHdlElement>(unit);
  if (!element || element->GetFile(file.Out()) != CitI::kOk || !file) return {};
  return FileFacts::PathOf(file.Get());
}

// The hierarchy with what the diagnostics and the file graph need; null when there is none.
const TreeInfo* ReadLinks(Vad::IHdlProject* project, TreeInfo& tree) {
  return TreeReader::ReadLinks(project, tree) == CitI::kOk ? &tree : nullptr;
}

constexpr auto kUnitsWithoutLinks = ProjectReader::UnitFields::kWithoutLinks;

// Every file the run reads: the sources and the project files and lists that named them.
std::vector<std::string> InputPaths(const ProjectSources& sources, const Options& options) {
  std::vector<std::string> paths;
  for (const SourceFile& file : sources.files) paths.push_back(file.path);
  for (const SourceArgument& argument : options.sources) paths.push_back(argument.path);
  return paths;
}

}  // namespace

CommandRunner::CommandRunner(const Options& options)
    : options_(options), colorOnError_(TerminalColor::Wanted(options.color, STDERR_FILENO)) {}

int CommandRunner::Run() {
  if (options_.command == Command::kFactories) return ListFactories();
  if (options_.command == Command::kWatch) return Watcher(options_).Run();
  MessageLog log(options_.quiet, options_.verbose, ColorOnStandardError());
  UseLog(&log);
  int status = RunOnProject();
  UseLog(nullptr);
  return status;
}

bool CommandRunner::ColorOnStandardError() const { return colorOnError_; }

int CommandRunner::BadInput(const std::string& text) {
  std::fprintf(stderr, "quillon: %s\n", text.c_str());
  return kExitBadInput;
}

Vad::IHdlDesignUnit* CommandRunner::FindUnit(ProjectReader& reader, const std::string& name) {
  UnitFinder finder(reader.designUnits());
  Vad::IHdlDesignUnit* unit = finder.Find(name);
  if (!unit) BadInput("unknown design unit '" + name + "'" + finder.DidYouMean(name));
  return unit;
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

void CommandRunner::UseLog(MessageLog* log) {
  log_ = log;
  if (log_ && options_.command == Command::kCheck) log_->DivertSyntaxErrors();
}

void CommandRunner::TakeSettings(const ProjectSources& sources) {
  notHdl_ = SourceFileCheck::NotHdl(sources.files, options_.strict);
  externalLibraries_ = sources.externalLibraries;
  externalLibraries_.insert(externalLibraries_.end(), options_.externalLibraries.begin(),
                            options_.externalLibraries.end());
  verilog_ = ExportPlanner::VerilogSettingsOf(sources.properties);
}

int CommandRunner::RunOn(Vad::IHdlProject* project, const ProjectSources& sources, std::ostream& out) {
  MessageLog log(options_.quiet, options_.verbose, ColorOnStandardError());
  UseLog(&log);
  TakeSettings(sources);
  shownPaths_ = ShownPaths(sources, options_.absolutePaths);
  int status = RunCommand(project, sources.files.size(), out);
  UseLog(nullptr);
  return status;
}

// Without a stored answer, the sources are gathered and the command runs; with one, neither.
// An answer is kept only when the sources could be gathered: what was missing has no stamp.
int CommandRunner::RunOnProject() {
  std::string directory = CacheDirectory();
  if (directory.empty() || !ResultCache::Applies(options_)) return LoadAndRun();
  ResultCache results(directory, options_);
  if (std::optional<ResultCache::Answer> stored = results.Lookup())
    return Emit(stored->output, stored->status);

  std::int64_t start = InputStamp::Now();
  OutputCapture capture;
  if (!capture.Begin()) return LoadAndRun();
  ProjectSources sources;
  std::string error;
  bool loaded = ProjectLoader(sources).Load(options_, error);
  int status = loaded ? RunOnSources(sources) : BadInput(error);
  OutputCapture::Captured output = capture.End();
  if (loaded) results.Store(sources, start, status, output);
  return Emit(output, status);
}

int CommandRunner::LoadAndRun() {
  ProjectSources sources;
  std::string error;
  if (!ProjectLoader(sources).Load(options_, error)) return BadInput(error);
  return RunOnSources(sources);
}

int CommandRunner::Emit(const OutputCapture::Captured& output, int status) {
  if (OutputCapture::Emit(output)) return status;
  std::fprintf(stderr, "quillon: the output could not be written\n");
  return kExitFailed;
}

int CommandRunner::RunOnSources(ProjectSources& sources) {
  TakeSettings(sources);
  std::string error;
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
  if (!AddLibraryModules(sources)) return kExitFailed;
  shownPaths_ = ShownPaths(sources, options_.absolutePaths);
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

std::vector<MessageInfo> CommandRunner::Messages() const {
  std::vector<MessageInfo> messages = log_->messages();
  shownPaths_.Apply(messages);
  return messages;
}

bool CommandRunner::AddLibraryModules(ProjectSources& sources) {
  const ProjectSources::LibrarySearch& search = sources.librarySearch;
  if (search.directories.empty() && search.files.empty()) return true;
  std::string error;
  log_->disable();
  bool resolved = LibraryResolver(sources).Resolve(error);
  log_->enable();
  if (!resolved) log_->ReportError(error);
  return resolved;
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
    if (options_.format == Format::kJson) JsonOutput::Messages(Messages(), out);
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
    case Command::kExport:
      return Export(reader, project, out);
    case Command::kFactories:
    case Command::kWatch:
      break;
  }
  return kExitFailed;
}

int CommandRunner::Units(ProjectReader& reader, std::ostream& out) {
  if (options_.format == Format::kJson) {
    std::vector<FileInfo> files = reader.Files();
    shownPaths_.Apply(files);
    JsonOutput::Units(files, Messages(), out);
  } else {
    reader.VisitFiles(kUnitsWithoutLinks, [&](FileInfo& file) {
      shownPaths_.Apply(file);
      TextOutput::Units(file, out);
    });
  }
  return Finished();
}

int CommandRunner::Tree(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out) {
  TreeView::Settings view{std::nullopt, options_.depth, options_.instancesOnly};
  Vad::IHdlDesignUnit* top = nullptr;
  if (!options_.top.empty()) {
    top = UnitFinder(reader.designUnits()).Find(options_.top);
    if (!top) return BadInput("unknown design unit '" + options_.top + "'");
  }
  TreeInfo tree;
  bool json = options_.format == Format::kJson;
  CitI::Result result = TreeReader::Read(project, tree, json);
  int status = result == CitI::kOk ? Finished() : Failed("the design hierarchy is not available", result);
  bool built = result == CitI::kOk;
  if (built && top) {
    view.top = TreeView::FindUnit(tree, KeyOf(top), FileOf(top));
    if (!view.top) {
      log_->ReportError("'" + options_.top + "' has no place in the design hierarchy");
      status = kExitFailed;
      built = false;
    }
  }
  // The order is not asked for: its cycle messages belong to the order command.
  std::vector<Diagnostic> diagnostics = DiagnosticReport::AsWarnings(
      Diagnose(reader.Files(kUnitsWithoutLinks), result == CitI::kOk ? &tree : nullptr, nullptr));
  if (built && !view.ShowsAll()) tree = TreeView::Select(tree, view);
  shownPaths_.Apply(tree);
  shownPaths_.Apply(diagnostics);
  ShowDiagnostics(diagnostics);
  if (json) {
    JsonOutput::Tree(built ? &tree : nullptr, Messages(), out, diagnostics);
  } else if (built && options_.format == Format::kDot) {
    DotOutput::Tree(tree, out);
  } else if (built) {
    TextOutput::Tree(tree, options_.verbose, out);
  }
  return status;
}

int CommandRunner::ComputeOrder(ProjectReader& reader, std::vector<OrderEntry>& order, bool& ordered) {
  CitI::Result result;
  ordered = false;
  if (options_.top.empty()) {
    result = reader.Order(order);
  } else {
    Vad::IHdlDesignUnit* unit = FindUnit(reader, options_.top);
    if (!unit) return kExitBadInput;
    result = reader.OrderOf(unit, options_.byUnit, order);
  }
  ordered = result == CitI::kOk;
  if (ordered && log_->OrderWasCut()) log_->ReportError(kCutOrder);
  if (result == kNoOrderForKind) {
    return Failed("a compile order of a single unit is given for entities, architectures and modules only",
                  result);
  }
  if (result == kNotInHierarchy)
    return Failed("'" + options_.top + "' has no place in the design hierarchy", result);
  if (!ordered) return Failed("the compile order is not available", result);
  return Finished();
}

int CommandRunner::Order(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out) {
  std::vector<OrderEntry> order;
  bool ordered = false;
  int status = ComputeOrder(reader, order, ordered);
  if (status == kExitBadInput) return status;

  TreeInfo tree;
  const TreeInfo* links = ReadLinks(project, tree);
  std::vector<Diagnostic> diagnostics = DiagnosticReport::AsWarnings(
      Diagnose(reader.Files(kUnitsWithoutLinks), links, ordered ? &order : nullptr));
  shownPaths_.Apply(order);
  shownPaths_.Apply(diagnostics);
  ShowDiagnostics(diagnostics);
  if (options_.format == Format::kJson) {
    JsonOutput::Order(ordered ? &order : nullptr, verilog_, Messages(), out, diagnostics);
  } else if (ordered && options_.format == Format::kDot) {
    shownPaths_.Apply(tree);
    DotOutput::Order(FileGraph::Build(tree, order), out);
  } else if (ordered) {
    TextOutput::Order(order, options_.withLibrary, out);
  }
  return status;
}

// Sources that no compiling tool takes (netlists, hierarchy files) are left out with a warning.
int CommandRunner::Export(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out) {
  std::vector<OrderEntry> order;
  bool ordered = false;
  int status = ComputeOrder(reader, order, ordered);
  if (!ordered) return status;
  TreeInfo tree;
  const TreeInfo* links = ReadLinks(project, tree);
  std::vector<FileInfo> files = reader.Files(kUnitsWithoutLinks);
  ShowDiagnostics(DiagnosticReport::AsWarnings(Diagnose(files, links, &order)));

  std::string topKey = options_.top.empty() ? "" : KeyOf(UnitFinder(reader.designUnits()).Find(options_.top));
  ExportPlan plan;
  std::vector<std::string> warnings;
  std::string error;
  if (!ExportPlanner::PlanProject(order, tree, files, verilog_, topKey, plan, warnings, error)) {
    log_->ReportError(error);
    return kExitFailed;
  }
  for (const std::string& warning : warnings) log_->ReportWarning(warning);
  // A format that cannot carry some path is found out midway: nothing is written then.
  std::ostringstream text;
  if (!ExportWriter::Write(options_.exportTo, plan, text, error)) {
    log_->ReportError(error);
    return kExitFailed;
  }
  out << text.str();
  return status;
}

// The module explains a failed extraction in its own messages; a unit whose kind of source has
// no port extraction gets no answer and no message, so quillon says so itself.
int CommandRunner::Ports(ProjectReader& reader, std::ostream& out) {
  Vad::IHdlDesignUnit* unit = FindUnit(reader, options_.unit);
  if (!unit) return kExitBadInput;
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
    JsonOutput::Ports(key, ports ? &*ports : nullptr, Messages(), out);
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
  std::vector<FileInfo> files = reader.Files(kUnitsWithoutLinks);
  TreeInfo tree;
  std::vector<Diagnostic> diagnostics = SourceFileCheck::SyntaxErrors(log_->received());
  diagnostics.insert(diagnostics.end(), notHdl_.begin(), notHdl_.end());
  for (Diagnostic& found : Diagnose(files, ReadLinks(project, tree), result == CitI::kOk ? &order : nullptr))
    diagnostics.push_back(std::move(found));
  if (result == CitI::kOk) {
    for (Diagnostic& ambiguous : ArchitectureCheck::Find(files, order, &shownPaths_))
      diagnostics.push_back(std::move(ambiguous));
    if (log_->OrderWasCut() && !HasCode(diagnostics, DiagnosticCode::kNoValidOrder))
      diagnostics.push_back({Diagnostic::Severity::kError, DiagnosticCode::kNoValidOrder, kCutOrder, "", 0});
  }
  shownPaths_.Apply(diagnostics);
  ShowDiagnostics(diagnostics);
  std::size_t errors = DiagnosticReport::Count(diagnostics, Diagnostic::Severity::kError);
  std::size_t warnings = DiagnosticReport::Count(diagnostics, Diagnostic::Severity::kWarning);
  if (errors > 0 || (options_.warningsAsErrors && (warnings > 0 || log_->getWarnCount() > 0)))
    status = kExitFailed;
  std::size_t units = reader.designUnits() ? reader.designUnits()->GetCount() : 0;
  if (options_.format == Format::kJson) {
    JsonOutput::Check(fileCount, units, Messages(), diagnostics, out);
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

std::vector<Diagnostic> CommandRunner::Diagnose(const std::vector<FileInfo>& files, const TreeInfo* tree,
                                                const std::vector<OrderEntry>* order) const {
  DiagnosticFinder::Settings settings;
  for (const std::string& library : externalLibraries_) {
    std::string lower = library;
    for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    settings.externalLibraries.insert(lower);
  }
  settings.strict = options_.strict;
  return DiagnosticFinder(std::move(settings)).Find(files, tree, order);
}

void CommandRunner::ShowDiagnostics(const std::vector<Diagnostic>& diagnostics) const {
  if (!options_.quiet) DiagnosticReport::Write(diagnostics, std::cerr, ColorOnStandardError());
}

}  // namespace quillon
