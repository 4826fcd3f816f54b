#include "DiagnosticFinder.h"

#include <algorithm>
#include <boost/graph/adjacency_list.hpp>
#include <boost/graph/strong_components.hpp>
#include <cctype>
#include <map>
#include <utility>

namespace quillon {

namespace {

// Libraries that every project may name without having them: the standard libraries and the
// maker's cell libraries, which the module does not track either.
const std::set<std::string> kLibrariesWithoutUnits = {"ieee",     "std",       "basecell",
                                                      "timecell", "blockcell", "corvanecorelib"};

std::string Lower(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return text;
}

bool IsHdlPlugin(const std::string& plugin) { return plugin == "PLUGIN_Vhdl" || plugin == "PLUGIN_Verilog"; }

bool IsPrimaryOrSecondaryUnit(const std::string& type) {
  return type == "Entity" || type == "Architecture" || type == "PackageDecl" || type == "PackageBody" ||
         type == "Module";
}

// "lib.name" into its two parts; the library part is empty for a plain name.
std::pair<std::string, std::string> SplitSelectedName(const std::string& name) {
  std::size_t dot = name.rfind('.');
  if (dot == std::string::npos) return {"", name};
  std::string library = name.substr(0, dot);
  std::size_t first = library.find('.');
  return {first == std::string::npos ? library : library.substr(0, first), name.substr(dot + 1)};
}

struct Place {
  std::string file;
  std::uint32_t line = 0;
};

std::string Where(const Place& place) { return place.file + ":" + std::to_string(place.line); }

// The units of the project by library and design-unit key ("entity|cpu"), both in lower case.
class UnitIndex {
 public:
  explicit UnitIndex(const std::vector<FileInfo>& files) {
    for (const FileInfo& file : files) {
      for (const UnitInfo& unit : file.units) {
        if (!IsPrimaryOrSecondaryUnit(unit.type)) continue;
        units_.insert(Key(file.library, unit.key));
        anyLibrary_.insert(Lower(unit.key));
      }
    }
  }

  bool Has(const std::string& library, const std::string& key) const {
    return units_.count(Key(library, key)) != 0;
  }
  // In any library: a component binds to an entity or module wherever the project has it.
  bool HasAnywhere(const std::string& key) const { return anyLibrary_.count(Lower(key)) != 0; }
  bool HasInstantiable(const std::string& library, const std::string& name) const {
    return Has(library, "Entity|" + name) || Has(library, "Module|" + name) ||
           Has(library, "PackageDecl|" + name);
  }

 private:
  static std::pair<std::string, std::string> Key(const std::string& library, const std::string& key) {
    return {Lower(library), Lower(key)};
  }

  std::set<std::pair<std::string, std::string>> units_;
  std::set<std::string> anyLibrary_;
};

// "work:Architecture|and2|" -> "and2", as the module reads a missing node's unit name.
std::string CellNameOf(const std::string& unit) {
  std::size_t colon = unit.rfind(':');
  std::string name = colon == std::string::npos ? unit : unit.substr(colon + 1);
  const std::string prefix = "Architecture|";
  if (name.compare(0, prefix.size(), prefix) == 0) name.erase(0, prefix.size());
  name.erase(std::remove(name.begin(), name.end(), '|'), name.end());
  return Lower(name);
}

// The unit names of the tree's library-cell nodes, in lower case.
std::set<std::string> LibraryCells(const TreeInfo* tree) {
  std::set<std::string> cells;
  if (!tree) return cells;
  for (const TreeNodeInfo& node : tree->nodes) {
    if (node.libraryCell) cells.insert(CellNameOf(node.unit));
  }
  return cells;
}

class FileChecker {
 public:
  FileChecker(const DiagnosticFinder::Settings& settings, const std::vector<FileInfo>& files,
              const UnitIndex& units, const std::set<std::string>& cells, std::vector<Diagnostic>& out)
      : settings_(settings), units_(units), cells_(cells), out_(out) {
    for (const FileInfo& file : files) projectLibraries_.insert(Lower(file.library));
  }

  void Check(const FileInfo& file) {
    file_ = &file;
    reportedLibraries_.clear();
    bool hasUnits = false;
    for (const UnitInfo& unit : file.units) {
      if (unit.type == "Library") {
        CheckLibraryName(unit.library.value_or(""), unit);
      } else if (unit.type == "Use") {
        CheckUse(unit);
      } else if (unit.type == "EntityInstantiation") {
        CheckEntityInstance(unit);
      } else if (unit.type == "ComponentInstantiation") {
        CheckComponentInstance(unit);
      }
      if (unit.type != "Library" && unit.type != "Use") hasUnits = true;
    }
    if (!hasUnits && IsHdlPlugin(file.plugin))
      Report(Diagnostic::Severity::kError, DiagnosticCode::kEmptySource,
             "no design unit was found in " + file.path, 0);
  }

 private:
  // The library a reference names, "work" read as the file's own.
  std::string Resolved(const std::string& library) const {
    return library.empty() || Lower(library) == "work" ? Lower(file_->library) : Lower(library);
  }
  bool HasNoUnits(const std::string& library) const {
    return kLibrariesWithoutUnits.count(library) != 0 || settings_.externalLibraries.count(library) != 0;
  }

  // False (with the error reported once per file) when the project does not have the library.
  bool CheckLibraryName(const std::string& name, const UnitInfo& unit) {
    std::string library = Resolved(name);
    if (HasNoUnits(library) || projectLibraries_.count(library) != 0) return true;
    if (reportedLibraries_.insert(library).second)
      Report(Diagnostic::Severity::kError, DiagnosticCode::kUnknownLibrary,
             "library '" + name + "' is not a library of the project (declare it with --external-library)",
             unit.line);
    return false;
  }

  void CheckUse(const UnitInfo& use) {
    const std::string library = use.library.value_or("");
    const std::string package = use.package.value_or("");
    // "use pkg.item;" names a package of the working library in its first part.
    if (units_.Has(file_->library, "PackageDecl|" + library)) return;
    if (HasNoUnits(Resolved(library)) || !CheckLibraryName(library, use)) return;
    if (package.empty() || Lower(package) == "all") return;
    if (!units_.Has(Resolved(library), "PackageDecl|" + package))
      Report(Diagnostic::Severity::kError, DiagnosticCode::kUnresolvedPackage,
             "package '" + package + "' of a use clause is not in library '" + Resolved(library) + "'",
             use.line);
  }

  void CheckEntityInstance(const UnitInfo& instance) {
    auto [named, entity] = SplitSelectedName(instance.entity.value_or(""));
    std::string library = Resolved(named);
    if (HasNoUnits(library) || !CheckLibraryName(named, instance)) return;
    const std::string architecture = instance.architecture.value_or("");
    if (!units_.HasInstantiable(library, entity)) {
      Report(Diagnostic::Severity::kError, DiagnosticCode::kUnresolvedInstance,
             "instance '" + instance.name + "': entity '" + entity + "' is not in library '" + library + "'",
             instance.line);
    } else if (!architecture.empty() && !units_.Has(library, "Architecture|" + entity + "|" + architecture)) {
      Report(Diagnostic::Severity::kError, DiagnosticCode::kUnresolvedInstance,
             "instance '" + instance.name + "': architecture '" + architecture + "' of entity '" + entity +
                 "' is not in library '" + library + "'",
             instance.line);
    }
  }

  void CheckComponentInstance(const UnitInfo& instance) {
    auto [named, component] = SplitSelectedName(instance.component.value_or(""));
    if (!named.empty() && HasNoUnits(Resolved(named))) return;
    if (units_.HasAnywhere("Entity|" + component) || units_.HasAnywhere("Module|" + component) ||
        cells_.count(Lower(component)) != 0)
      return;
    Report(
        settings_.strict ? Diagnostic::Severity::kError : Diagnostic::Severity::kWarning,
        DiagnosticCode::kBlackBox,
        "instance '" + instance.name + "': the project has no unit '" + component + "', it stays a black box",
        instance.line);
  }

  void Report(Diagnostic::Severity severity, const char* code, std::string text, std::uint32_t line) {
    out_.push_back({severity, code, std::move(text), file_->path, line});
  }

  const DiagnosticFinder::Settings& settings_;
  const UnitIndex& units_;
  const std::set<std::string>& cells_;
  std::vector<Diagnostic>& out_;
  std::set<std::string> projectLibraries_;
  std::set<std::string> reportedLibraries_;
  const FileInfo* file_ = nullptr;
};

void FindDuplicates(const std::vector<FileInfo>& files, std::vector<Diagnostic>& out) {
  std::map<std::pair<std::string, std::string>, Place> first;
  for (const FileInfo& file : files) {
    for (const UnitInfo& unit : file.units) {
      if (!IsPrimaryOrSecondaryUnit(unit.type)) continue;
      std::string key = file.plugin == "PLUGIN_Verilog" ? unit.key : Lower(unit.key);
      Place place{file.path, unit.line};
      auto [found, inserted] = first.emplace(std::make_pair(Lower(file.library), key), place);
      if (inserted) continue;
      out.push_back({Diagnostic::Severity::kError, DiagnosticCode::kDuplicateUnit,
                     unit.key + " of library '" + file.library + "' is defined twice: at " +
                         Where(found->second) + " and at " + Where(place),
                     file.path, unit.line});
    }
  }
}

// Files that use each other through entities and packages: the cycles that the module's relaxed
// rule keeps, so that no order can put every file after what it uses.
void FindCycles(const TreeInfo& tree, const std::vector<OrderEntry>& order, std::vector<Diagnostic>& out) {
  std::map<std::string, std::size_t> index;
  std::vector<std::string> paths;
  for (const OrderEntry& entry : order) {
    if (index.emplace(entry.path, paths.size()).second) paths.push_back(entry.path);
  }
  std::set<std::pair<std::size_t, std::size_t>> edges;
  for (const TreeNodeInfo& node : tree.nodes) {
    auto from = node.file ? index.find(*node.file) : index.end();
    for (std::size_t childIndex : node.children) {
      const TreeNodeInfo& child = tree.nodes[tree.nodes[childIndex].sharedWith.value_or(childIndex)];
      bool declaration = child.elementType == "Entity" || child.elementType == "PackageDecl";
      auto to = child.file ? index.find(*child.file) : index.end();
      if (declaration && from != index.end() && to != index.end() && from->second != to->second)
        edges.insert({from->second, to->second});
    }
  }
  boost::adjacency_list<boost::vecS, boost::vecS, boost::directedS> graph(paths.size());
  for (const auto& [from, to] : edges) boost::add_edge(from, to, graph);
  std::vector<int> component(paths.size());
  if (!paths.empty()) boost::strong_components(graph, component.data());
  std::map<int, std::vector<std::size_t>> members;
  for (std::size_t file = 0; file < paths.size(); ++file) members[component[file]].push_back(file);
  for (const auto& [id, files] : members) {
    if (files.size() < 2) continue;
    std::string list;
    for (std::size_t file : files) list += (list.empty() ? "" : ", ") + paths[file];
    out.push_back({Diagnostic::Severity::kError, DiagnosticCode::kNoValidOrder,
                   "no valid compile order: these files use each other's entities or packages: " + list,
                   paths[files.front()], 0});
  }
}

}  // namespace

DiagnosticFinder::DiagnosticFinder(Settings settings) : settings_(std::move(settings)) {}

std::vector<Diagnostic> DiagnosticFinder::Find(const std::vector<FileInfo>& files, const TreeInfo* tree,
                                               const std::vector<OrderEntry>* order) const {
  std::vector<Diagnostic> found;
  UnitIndex units(files);
  std::set<std::string> cells = LibraryCells(tree);
  FileChecker checker(settings_, files, units, cells, found);
  for (const FileInfo& file : files) checker.Check(file);
  FindDuplicates(files, found);
  if (tree && !tree->nodes.empty() && order) FindCycles(*tree, *order, found);
  return found;
}

}  // namespace quillon
