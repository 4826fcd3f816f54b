// A project built for a script: the command line's reading code behind calls that hand back
// plain values and throw ScriptError on failure. Not thread-safe: the caller serialises every
// call, construction and destruction included, since the module and the host's message dispatcher
// are one per process.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "DesignModel.h"
#include "Diagnostic.h"
#include "MessageLog.h"
#include "Options.h"
#include "Progress.h"
#include "ProjectBuilder.h"
#include "ProjectReader.h"

namespace quillon {

class ScriptProject {
 public:
  // Where a node's element is declared; empty for a node without one.
  struct NodePlace {
    std::string library;
    std::uint32_t line = 0;
  };
  // The hierarchy, the node asked for, and the place of every node.
  struct Hierarchy {
    TreeInfo tree;
    std::size_t top = 0;
    std::vector<NodePlace> places;
  };

  // Loads the module (once per process; `modulePath` unless QUILLON_MODULE names another), reads
  // the sources and properties of `options` as the command line does, and parses every file.
  ScriptProject(const Options& options, const std::string& modulePath);
  ~ScriptProject();
  ScriptProject(const ScriptProject&) = delete;
  ScriptProject& operator=(const ScriptProject&) = delete;

  std::vector<FileInfo> Files();
  // The whole hierarchy; with a `top`, its first node that stands for that unit (an entity stands
  // for its architecture) is the one asked for.
  Hierarchy Tree(const std::string& top);
  // The whole project's compile order, or that of `top` and what it needs (byUnit: `top` alone).
  std::vector<OrderEntry> Order(const std::string& top, bool byUnit);
  // The order as `quillon export --to FORMAT` writes it for a compiling tool.
  std::string Export(const std::string& format, const std::string& top, bool byUnit);
  std::vector<PortInfo> Ports(const std::string& unit);
  // What `check` finds: broken and incomplete parts of the design.
  std::vector<Diagnostic> Diagnostics();

  // Every message of the module and the host since the project was built, in order.
  const std::vector<MessageInfo>& messages() const { return messages_; }

 private:
  // Collects the messages of one request while it runs.
  class Request;

  static void LoadModule(const std::string& modulePath);
  Vad::IHdlProject* project() const { return builder_->project(); }
  Vad::IHdlDesignUnit* FindUnit(const std::string& name) const;
  std::vector<Diagnostic> Diagnose(const std::vector<OrderEntry>* order) const;
  void PlaceNodes(Hierarchy& hierarchy) const;

  Options options_;
  std::vector<std::string> externalLibraries_;
  VerilogSettings verilog_;
  Progress progress_{true, 0};
  std::unique_ptr<ProjectBuilder> builder_ = std::make_unique<ProjectBuilder>();
  std::unique_ptr<ProjectReader> reader_;
  std::vector<MessageInfo> messages_;
};

}  // namespace quillon
