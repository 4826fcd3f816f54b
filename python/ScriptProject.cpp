#include "ScriptProject.h"

#include <algorithm>
#include <cctype>
#include <map>
#include <sstream>
#include <utility>

#include "ArchitectureCheck.h"
#include "DeveloperTextCapture.h"
#include "DiagnosticFinder.h"
#include "ExportPlanner.h"
#include "ExportWriter.h"
#include "Host/HostComponents.h"
#include "IName.h"
#include "ModuleLoader.h"
#include "ProjectLoader.h"
#include "ScriptError.h"
#include "TreeReader.h"
#include "UnitFinder.h"

namespace quillon {

namespace {

// What getCompileOrderByDU answers for a unit kind that has no order of its own, and for a unit
// that is not in the hierarchy.
constexpr CitI::Result kNoOrderForKind = 4;
constexpr CitI::Result kNotInHierarchy = 5;

std::string KeyOf(Vad::IHdlDesignUnit* unit) {
  Port::StringBase key;
  if (auto* name = Prjrep::QueryAs<Prjrep::IName>(unit)) name->GetName(&key);
  return key.str();
}

// "Architecture|cpu|rtl" -> {"Architecture", "cpu"}.
std::pair<std::string, std::string> TypeAndNameOf(const std::string& key) {
  std::size_t first = key.find('|');
  if (first == std::string::npos) return {key, ""};
  std::size_t second = key.find('|', first + 1);
  return {key.substr(0, first),
          key.substr(first + 1, second == std::string::npos ? second : second - first - 1)};
}

// An entity stands for the architectures over it, which hold its instances.
bool StandsFor(const TreeNodeInfo& node, const std::string& key) {
  if (!node.elementKey || node.sharedWith) return false;
  if (*node.elementKey == key) return true;
  auto [type, name] = TypeAndNameOf(key);
  auto [nodeType, nodeName] = TypeAndNameOf(*node.elementKey);
  return type == "Entity" && nodeType == "Architecture" && nodeName == name;
}

std::string Lowered(std::string text) {
  for (char& c : text) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return text;
}

}  // namespace

// Collects the messages of one request while it runs, and turns a failure into a ScriptError
// that carries them.
class ScriptProject::Request {
 public:
  explicit Request(ScriptProject& project) : project_(project), log_(true, false, false) {}
  ~Request() {
    project_.messages_.insert(project_.messages_.end(), log_.messages().begin(), log_.messages().end());
  }
  Request(const Request&) = delete;
  Request& operator=(const Request&) = delete;

  MessageLog& log() { return log_; }

  [[noreturn]] void Fail(const std::string& reason) const {
    std::vector<std::string> texts{reason};
    for (const MessageInfo& message : log_.messages()) {
      if (message.severity == "error" && std::find(texts.begin(), texts.end(), message.text) == texts.end())
        texts.push_back(message.text);
    }
    throw ScriptError(reason, std::move(texts));
  }

 private:
  ScriptProject& project_;
  MessageLog log_;
};

void ScriptProject::LoadModule(const std::string& modulePath) {
  static ModuleLoader module;
  static bool loaded = false;
  if (loaded) return;
  std::string error;
  if (!Host::RegisterHostComponents()) throw ScriptError("the host components cannot be registered", {});
  if (!module.LoadInstead(modulePath, error)) throw ScriptError(error, {error});
  ProjectBuilder::SetInstallRootWhenUnset();
  loaded = true;
}

ScriptProject::ScriptProject(const Options& options, const std::string& modulePath) : options_(options) {
  ProjectSources sources;
  std::string error;
  if (!ProjectLoader(sources).Load(options_, error)) throw ScriptError(error, {error});
  externalLibraries_ = sources.externalLibraries;
  externalLibraries_.insert(externalLibraries_.end(), options_.externalLibraries.begin(),
                            options_.externalLibraries.end());
  verilog_ = ExportPlanner::VerilogSettingsOf(sources.properties);
  LoadModule(modulePath);

  Request request(*this);
  for (const std::string& warning : sources.warnings) request.log().ReportWarning(warning);
  if (!builder_->Build(sources, error)) request.Fail(error);
  reader_ = std::make_unique<ProjectReader>(project(), progress_);
  if (reader_->Parse() != CitI::kOk) request.Fail("the sources could not be read");
}

// The reader holds the design units, which go before the project.
ScriptProject::~ScriptProject() {
  Request request(*this);
  reader_.reset();
  builder_.reset();
}

std::vector<FileInfo> ScriptProject::Files() {
  Request request(*this);
  return reader_->Files();
}

Vad::IHdlDesignUnit* ScriptProject::FindUnit(const std::string& name) const {
  Vad::IHdlDesignUnit* unit = UnitFinder(reader_->designUnits()).Find(name);
  if (!unit) throw ScriptError("unknown design unit '" + name + "'", {"unknown design unit '" + name + "'"});
  return unit;
}

ScriptProject::Hierarchy ScriptProject::Tree(const std::string& top) {
  Request request(*this);
  Vad::IHdlDesignUnit* unit = top.empty() ? nullptr : FindUnit(top);
  Hierarchy hierarchy;
  if (TreeReader::Read(project(), hierarchy.tree, true) != CitI::kOk)
    request.Fail("the design hierarchy is not available");
  if (unit) {
    std::string key = KeyOf(unit);
    const std::vector<TreeNodeInfo>& nodes = hierarchy.tree.nodes;
    auto found = std::find_if(nodes.begin(), nodes.end(),
                              [&](const TreeNodeInfo& node) { return StandsFor(node, key); });
    if (found == nodes.end()) request.Fail("'" + top + "' has no place in the design hierarchy");
    hierarchy.top = static_cast<std::size_t>(found - nodes.begin());
  }
  PlaceNodes(hierarchy);
  return hierarchy;
}

// The library and line of a node are those of its element's record in the file's unit set.
void ScriptProject::PlaceNodes(Hierarchy& hierarchy) const {
  std::map<std::pair<std::string, std::string>, NodePlace> places;
  for (const FileInfo& file : reader_->Files()) {
    for (const UnitInfo& unit : file.units)
      places.try_emplace({file.path, unit.key}, NodePlace{file.library, unit.line});
  }
  hierarchy.places.resize(hierarchy.tree.nodes.size());
  for (std::size_t index = 0; index < hierarchy.tree.nodes.size(); ++index) {
    const TreeNodeInfo& node = hierarchy.tree.nodes[index];
    if (!node.file || !node.elementKey) continue;
    auto place = places.find({*node.file, *node.elementKey});
    if (place != places.end()) hierarchy.places[index] = place->second;
  }
}

std::vector<OrderEntry> ScriptProject::Order(const std::string& top, bool byUnit) {
  Request request(*this);
  std::vector<OrderEntry> order;
  CitI::Result result = top.empty() ? reader_->Order(order) : reader_->OrderOf(FindUnit(top), byUnit, order);
  if (result == kNoOrderForKind)
    request.Fail("a compile order of a single unit is given for entities, architectures and modules only");
  if (result == kNotInHierarchy) request.Fail("'" + top + "' has no place in the design hierarchy");
  if (result != CitI::kOk) request.Fail("the compile order is not available");
  return order;
}

std::string ScriptProject::Export(const std::string& format, const std::string& top, bool byUnit) {
  std::vector<OrderEntry> order = Order(top, byUnit);
  Request request(*this);
  TreeInfo tree;
  TreeReader::Read(project(), tree, false);
  ExportPlan plan;
  std::vector<std::string> warnings;
  std::string error;
  if (!ExportPlanner::PlanProject(order, tree, reader_->Files(), verilog_,
                                  top.empty() ? "" : KeyOf(FindUnit(top)), plan, warnings, error))
    request.Fail(error);
  for (const std::string& warning : warnings) request.log().ReportWarning(warning);
  std::ostringstream text;
  if (!ExportWriter::Write(format, plan, text, error)) request.Fail(error);
  return text.str();
}

std::vector<PortInfo> ScriptProject::Ports(const std::string& unitName) {
  Request request(*this);
  Vad::IHdlDesignUnit* unit = FindUnit(unitName);
  std::string key = KeyOf(unit);
  std::optional<std::vector<PortInfo>> ports;
  std::string reason;
  CitI::Result result;
  {
    DeveloperTextCapture developerTexts;
    result = reader_->PortsOf(unit, ports);
    reason = developerTexts.LastLineStartingWith("ports of " + key + ": ");
  }
  if (result != CitI::kOk || !ports) {
    request.Fail(!reason.empty() ? reason
                                 : "the ports of " + key +
                                       " are not available: ports are extracted from VHDL and Verilog only");
  }
  return std::move(*ports);
}

std::vector<Diagnostic> ScriptProject::Diagnostics() {
  Request request(*this);
  std::vector<OrderEntry> order;
  bool ordered = reader_->Order(order) == CitI::kOk;
  std::vector<Diagnostic> diagnostics = Diagnose(ordered ? &order : nullptr);
  if (!ordered) return diagnostics;
  for (Diagnostic& ambiguous : ArchitectureCheck::Find(reader_->Files(), order))
    diagnostics.push_back(std::move(ambiguous));
  bool listed = std::any_of(diagnostics.begin(), diagnostics.end(),
                            [](const Diagnostic& d) { return d.code == DiagnosticCode::kNoValidOrder; });
  if (request.log().OrderWasCut() && !listed) {
    diagnostics.push_back({Diagnostic::Severity::kError, DiagnosticCode::kNoValidOrder,
                           "no valid compile order exists: files use each other, and the order breaks those "
                           "dependencies",
                           "", 0});
  }
  return diagnostics;
}

std::vector<Diagnostic> ScriptProject::Diagnose(const std::vector<OrderEntry>* order) const {
  DiagnosticFinder::Settings settings;
  for (const std::string& library : externalLibraries_) settings.externalLibraries.insert(Lowered(library));
  settings.strict = options_.strict;
  TreeInfo tree;
  bool built = TreeReader::Read(project(), tree, false) == CitI::kOk;
  return DiagnosticFinder(std::move(settings)).Find(reader_->Files(), built ? &tree : nullptr, order);
}

}  // namespace quillon
