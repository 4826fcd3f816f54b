// quillon._core: the bindings under the Python package quillon. Every call into the module runs
// with the interpreter lock released and under one process-wide lock, since the module and the
// host's message dispatcher are one per process.
#include <dlfcn.h>
#include <pybind11/pybind11.h>
#include <pybind11/stl.h>

#include <cstdlib>
#include <filesystem>
#include <mutex>

#include "PluginTable.h"
#include "Port/SafeCount.h"
#include "ScriptError.h"
#include "ScriptProject.h"

namespace py = pybind11;
using namespace pybind11::literals;

namespace quillon {

namespace {

std::mutex& ModuleLock() {
  static std::mutex lock;
  return lock;
}

// Runs `work` without the interpreter lock; the module lock is taken only after the interpreter
// lock is given up, so that no thread ever waits for one while holding the other.
template <class Work>
auto Unlocked(Work work) {
  py::gil_scoped_release released;
  std::lock_guard<std::mutex> lock(ModuleLock());
  return work();
}

struct LockedDelete {
  void operator()(ScriptProject* project) const {
    std::unique_lock<std::mutex> lock(ModuleLock(), std::try_to_lock);
    if (lock) {
      delete project;
      return;
    }
    Unlocked([project] {
      delete project;
      return 0;
    });
  }
};
using ProjectHolder = std::unique_ptr<ScriptProject, LockedDelete>;

std::filesystem::path ExtensionDirectory() {
  Dl_info info{};
  if (!dladdr(reinterpret_cast<void*>(&ExtensionDirectory), &info) || !info.dli_fname) return {};
  return std::filesystem::path(info.dli_fname).parent_path();
}

// Installed, the module and the cell libraries lie at fixed places relative to this extension;
// in the build tree they are where the build put them.
std::filesystem::path Installed(const char* relative) {
  std::filesystem::path here = ExtensionDirectory();
  if (here.empty()) return {};
  std::error_code ignored;
  std::filesystem::path path = (here / relative).lexically_normal();
  return std::filesystem::exists(path, ignored) ? path : std::filesystem::path();
}

std::string ModulePath() {
  std::filesystem::path installed = Installed(QUILLON_MODULE_FROM_EXTENSION);
  return installed.empty() ? std::string(QUILLON_BUILT_MODULE) : installed.string();
}

void UseInstalledCellLibraries() {
  std::filesystem::path data = Installed(QUILLON_DATA_FROM_EXTENSION);
  if (data.empty()) return;
  setenv("CORVANE", data.c_str(), 0);
  setenv("QUILLON_DATA_DIR", (data / "share").c_str(), 0);
}

SourceArgument::Kind KindNamed(const std::string& kind) {
  if (kind == "project") return SourceArgument::Kind::kProjectFile;
  if (kind == "list") return SourceArgument::Kind::kFileList;
  if (kind == "file") return SourceArgument::Kind::kFile;
  throw py::value_error("unknown kind of source '" + kind + "'");
}

// A ';' would split an entry of the module's macro and include directory lists.
void RequireListEntries(const std::vector<std::string>& values, const char* what) {
  for (const std::string& value : values) {
    if (!Options::FitsList(value)) throw py::value_error(std::string(what) + " '" + value + "' holds a ';'");
  }
}

py::object OrNone(const std::optional<std::string>& text) {
  return text ? py::object(py::str(*text)) : py::object(py::none());
}

template <class Number>
py::object OrNone(const std::optional<Number>& number) {
  return number ? py::object(py::int_(*number)) : py::object(py::none());
}

py::dict UnitDict(const UnitInfo& unit, const FileInfo& file) {
  py::object uses = py::none();
  if (unit.uses) uses = py::tuple(py::cast(*unit.uses));
  return py::dict("type"_a = unit.type, "name"_a = unit.name, "key"_a = unit.key, "file"_a = file.path,
                  "library"_a = file.library, "line"_a = unit.line, "store_key"_a = unit.storeKey,
                  "parent"_a = OrNone(unit.parent), "in_generate"_a = unit.inGenerate,
                  "unit_flag"_a = unit.unitFlag, "partition"_a = unit.partition,
                  "entity"_a = OrNone(unit.entity), "architecture"_a = OrNone(unit.architecture),
                  "component"_a = OrNone(unit.component), "named_library"_a = OrNone(unit.library),
                  "package"_a = OrNone(unit.package), "item"_a = OrNone(unit.item), "uses"_a = uses);
}

py::list Units(ScriptProject& project) {
  std::vector<FileInfo> files = Unlocked([&] { return project.Files(); });
  py::list units;
  for (const FileInfo& file : files) {
    for (const UnitInfo& unit : file.units) units.append(UnitDict(unit, file));
  }
  return units;
}

py::dict NodeDict(const TreeNodeInfo& node, const ScriptProject::NodePlace& place) {
  // A node without an element of the project (a library cell) has its library in its kind.
  std::size_t colon = node.kind.find(':');
  py::object library = py::none();
  if (!place.library.empty()) {
    library = py::str(place.library);
  } else if (colon != std::string::npos) {
    library = py::str(node.kind.substr(0, colon));
  }
  return py::dict(
      "name"_a = node.name, "kind"_a = node.kind, "unit"_a = node.unit, "architecture"_a = node.architecture,
      "instance"_a = node.instance, "library"_a = library, "file"_a = OrNone(node.file),
      "line"_a = place.line ? py::object(py::int_(place.line)) : py::none(),
      "key"_a = OrNone(node.elementKey), "element_type"_a = OrNone(node.elementType), "path"_a = node.path,
      "type"_a = node.type, "library_cell"_a = node.libraryCell, "partition"_a = node.partition,
      "children"_a = py::cast(node.children), "shared_with"_a = OrNone(node.sharedWith));
}

py::tuple Tree(ScriptProject& project, const std::string& top) {
  ScriptProject::Hierarchy hierarchy = Unlocked([&] { return project.Tree(top); });
  py::list nodes;
  for (std::size_t index = 0; index < hierarchy.tree.nodes.size(); ++index)
    nodes.append(NodeDict(hierarchy.tree.nodes[index], hierarchy.places[index]));
  return py::make_tuple(nodes, hierarchy.top);
}

py::list Order(ScriptProject& project, const std::string& top, bool byUnit) {
  std::vector<OrderEntry> order = Unlocked([&] { return project.Order(top, byUnit); });
  py::list files;
  for (const OrderEntry& entry : order)
    files.append(py::dict("path"_a = entry.path, "library"_a = entry.library,
                          "language"_a = PluginTable::FileTypeName(entry.plugin), "plugin"_a = entry.plugin));
  return files;
}

py::str Export(ScriptProject& project, const std::string& format, const std::string& top, bool byUnit) {
  return py::str(Unlocked([&] { return project.Export(format, top, byUnit); }));
}

py::list Ports(ScriptProject& project, const std::string& unit) {
  std::vector<PortInfo> ports = Unlocked([&] { return project.Ports(unit); });
  py::list list;
  for (const PortInfo& port : ports) {
    list.append(py::dict("name"_a = port.name, "position"_a = port.position, "type"_a = port.type,
                         "direction"_a = port.direction, "low"_a = OrNone(port.low),
                         "high"_a = OrNone(port.high), "span"_a = OrNone(port.span)));
  }
  return list;
}

py::list Diagnostics(ScriptProject& project) {
  std::vector<Diagnostic> diagnostics = Unlocked([&] { return project.Diagnostics(); });
  py::list list;
  for (const Diagnostic& diagnostic : diagnostics) {
    py::object file = diagnostic.file.empty() ? py::none() : py::object(py::str(diagnostic.file));
    py::object line = diagnostic.line ? py::object(py::int_(diagnostic.line)) : py::none();
    list.append(py::dict("severity"_a = std::string(diagnostic.SeverityText()), "code"_a = diagnostic.code,
                         "text"_a = diagnostic.text, "file"_a = file, "line"_a = line));
  }
  return list;
}

py::list Messages(ScriptProject& project) {
  std::vector<MessageInfo> messages = Unlocked([&] { return project.messages(); });
  py::list list;
  for (const MessageInfo& message : messages) {
    py::object source = message.source.empty() ? py::none() : py::object(py::str(message.source));
    py::object line = message.line > 0 ? py::object(py::int_(message.line)) : py::none();
    list.append(py::dict("severity"_a = message.severity, "text"_a = message.text, "source"_a = source,
                         "line"_a = line));
  }
  return list;
}

ProjectHolder MakeProject(
    const std::vector<std::tuple<std::string, std::string, std::string, std::string>>& sources,
    const std::vector<std::string>& defines, const std::vector<std::string>& includeDirs,
    const std::vector<std::pair<std::string, std::string>>& properties,
    const std::optional<std::string>& target, const std::optional<std::string>& family,
    const std::vector<std::string>& externalLibraries, bool strict) {
  Options options;
  for (const auto& [kind, path, library, plugin] : sources)
    options.sources.push_back({KindNamed(kind), path, library, plugin});
  RequireListEntries(defines, "the define");
  RequireListEntries(includeDirs, "the include directory");
  options.defines = defines;
  options.includeDirs = includeDirs;
  options.properties = properties;
  options.target = target;
  options.family = family;
  options.externalLibraries = externalLibraries;
  options.strict = strict;
  std::string modulePath = ModulePath();
  return ProjectHolder(Unlocked([&] { return new ScriptProject(options, modulePath); }));
}

}  // namespace

}  // namespace quillon

PYBIND11_MODULE(_core, module) {
  using namespace quillon;
  module.doc() = "Bindings of the Quillon module; use the package quillon.";
  UseInstalledCellLibraries();

  static py::exception<ScriptError> error(module, "Error");
  error.attr("__module__") = "quillon";
  error.doc() = "A request to Quillon failed; .messages holds the reason and the error messages.";
  py::register_exception_translator([](std::exception_ptr failure) {
    try {
      if (failure) std::rethrow_exception(failure);
    } catch (const ScriptError& scriptError) {
      py::object instance = py::reinterpret_borrow<py::object>(error.ptr())(scriptError.what());
      instance.attr("messages") = py::cast(scriptError.messages());
      PyErr_SetObject(error.ptr(), instance.ptr());
    }
  });

  py::class_<ScriptProject, ProjectHolder>(module, "Project")
      .def(py::init(&MakeProject), "sources"_a, "defines"_a, "include_dirs"_a, "properties"_a, "target"_a,
           "family"_a, "external_libraries"_a, "strict"_a)
      .def("units", &Units)
      .def("tree", &Tree, "top"_a)
      .def("order", &Order, "top"_a, "by_unit"_a)
      .def("export", &Export, "format"_a, "top"_a, "by_unit"_a)
      .def("ports", &Ports, "unit"_a)
      .def("diagnostics", &Diagnostics)
      .def("messages", &Messages);
  module.def("_live_objects", [] { return Port::LiveObjectCount(); });
}
