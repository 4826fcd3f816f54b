// Runs one quillon command: loads the module, builds the project, asks the module and writes the
// answer. Every problem ends in an exit status and a message, never in an exception.
#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "Diagnostic.h"
#include "MessageLog.h"
#include "Options.h"
#include "OutputCapture.h"
#include "ProjectReader.h"
#include "ProjectSources.h"
#include "ShownPaths.h"

namespace quillon {

class CommandRunner {
 public:
  // Whether standard error takes colour is settled here, before any output is captured.
  explicit CommandRunner(const Options& options);

  // The exit status (ExitStatus.h).
  int Run();
  // The command on a project built already from `sources`, with messages of its own; for watch.
  int RunOn(Vad::IHdlProject* project, const ProjectSources& sources, std::ostream& out);

 private:
  int ListFactories();
  // The external libraries and the Verilog settings of the sources.
  void TakeSettings(const ProjectSources& sources);
  // The log of one run; `check` takes the syntax errors out of its messages.
  void UseLog(MessageLog* log);
  int RunOnProject();
  // Gathers the sources and runs the command on them.
  int LoadAndRun();
  // The command on gathered sources, from the library search on.
  int RunOnSources(ProjectSources& sources);
  // Writes a captured or stored answer; `status`, or kExitFailed when the output cannot take it.
  static int Emit(const OutputCapture::Captured& output, int status);
  int RunCommand(Vad::IHdlProject* project, std::size_t fileCount, std::ostream& out);
  int ParseAndRun(Vad::IHdlProject* project, std::size_t fileCount, Progress& progress, std::ostream& out);
  int Units(ProjectReader& reader, std::ostream& out);
  int Tree(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out);
  int Order(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out);
  int Export(ProjectReader& reader, Vad::IHdlProject* project, std::ostream& out);
  // The order of the whole project or of --top/--unit, failures reported: the exit status so far
  // and whether `order` was filled.
  int ComputeOrder(ProjectReader& reader, std::vector<OrderEntry>& order, bool& ordered);
  int Ports(ProjectReader& reader, std::ostream& out);
  int Check(ProjectReader& reader, Vad::IHdlProject* project, std::size_t fileCount, std::ostream& out);

  // quillon's own findings about the design; `tree` and `order` may be null.
  std::vector<Diagnostic> Diagnose(const std::vector<FileInfo>& files, const TreeInfo* tree,
                                   const std::vector<OrderEntry>* order) const;
  bool ColorOnStandardError() const;
  // Writes the diagnostics to standard error unless quiet.
  void ShowDiagnostics(const std::vector<Diagnostic>& diagnostics) const;
  // The messages so far, with their source files as the output shows them.
  std::vector<MessageInfo> Messages() const;
  // Adds the -y and -v files that the sources need; false after reporting why not.
  bool AddLibraryModules(ProjectSources& sources);

  // Reports the module's failure of `what` and returns kExitFailed.
  int Failed(const std::string& what, CitI::Result result);
  // The exit status of an operation that succeeded: kExitFailed when errors were reported.
  int Finished() const;
  // The unit that `name` names, or null after saying it is unknown (and which units come close).
  static Vad::IHdlDesignUnit* FindUnit(ProjectReader& reader, const std::string& name);
  // Writes "quillon: text" to standard error and returns kExitBadInput.
  static int BadInput(const std::string& text);

  // The parse cache's directory for this run; empty for none.
  std::string CacheDirectory() const;
  // What every file's parse depends on besides the file: properties, cell libraries, module.
  static std::string CacheInputs(const ProjectSources& sources, const std::string& modulePath);

  const Options& options_;
  bool colorOnError_;
  std::string cacheInputs_;
  MessageLog* log_ = nullptr;
  // From the command line and the project file.
  std::vector<std::string> externalLibraries_;
  std::vector<Diagnostic> notHdl_;  // of the sources, found once they are known
  VerilogSettings verilog_;
  ShownPaths shownPaths_;
};

}  // namespace quillon
