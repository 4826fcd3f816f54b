#include "ExportPlanner.h"

#include <algorithm>
#include <cctype>
#include <map>

#include "FileGraph.h"
#include "ProjectLoader.h"

namespace quillon {

namespace {

std::optional<SourceLanguage> LanguageOf(const OrderEntry& entry) {
  if (entry.plugin == "PLUGIN_Vhdl") return SourceLanguage::kVhdl;
  if (entry.plugin != "PLUGIN_Verilog") return std::nullopt;
  std::string extension = entry.path.substr(std::min(entry.path.size(), entry.path.rfind('.')));
  std::transform(extension.begin(), extension.end(), extension.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return extension == ".sv" ? SourceLanguage::kSystemVerilog : SourceLanguage::kVerilog;
}

bool IsPlainIdentifier(std::string_view name) {
  auto isWordChar = [](unsigned char c) { return std::isalnum(c) || c == '_'; };
  return !name.empty() && std::isalpha(static_cast<unsigned char>(name[0])) &&
         std::all_of(name.begin(), name.end(), isWordChar);
}

std::vector<std::string> Split(std::string_view text, char separator) {
  std::vector<std::string> pieces;
  std::size_t start = 0;
  while (start <= text.size()) {
    std::size_t end = std::min(text.find(separator, start), text.size());
    pieces.emplace_back(text.substr(start, end - start));
    start = end + 1;
  }
  return pieces;
}

}  // namespace

std::vector<std::string> ExportPlanner::ListEntries(std::string_view list) {
  std::string unified(list);
  std::replace(unified.begin(), unified.end(), '|', ';');
  std::vector<std::string> entries = Split(unified, ';');
  std::erase_if(entries, [](const std::string& entry) { return entry.empty(); });
  return entries;
}

bool ExportPlanner::Plan(const std::vector<OrderEntry>& order, const FileGraphInfo& graph, ExportPlan& plan,
                         std::vector<std::string>& leftOut, std::string& error) {
  std::map<std::string, std::size_t> planIndex;
  std::optional<std::size_t> lastVerilog;
  for (const OrderEntry& entry : order) {
    if (planIndex.count(entry.path)) continue;
    std::optional<SourceLanguage> language = LanguageOf(entry);
    if (!language) {
      leftOut.push_back(entry.path);
      continue;
    }
    if (entry.path.find_first_of("\r\n") != std::string::npos) {
      error = "cannot export " + entry.path + ": the path holds a line break";
      return false;
    }
    if (!IsPlainIdentifier(entry.library)) {
      error = "cannot export " + entry.path + ": its library '" + entry.library +
              "' is no plain identifier (letters, digits and '_', starting with a letter)";
      return false;
    }
    std::size_t index = plan.sources.size();
    ExportSource source{entry.path, entry.library, *language, {}};
    if (*language != SourceLanguage::kVhdl) {
      if (lastVerilog) source.needs.push_back(*lastVerilog);
      lastVerilog = index;
    }
    plan.sources.push_back(std::move(source));
    planIndex[entry.path] = index;
  }
  // An edge to a later source is one that the order cut to break a cycle.
  for (const FileEdge& edge : graph.edges) {
    auto from = planIndex.find(graph.files[edge.from].path);
    auto to = planIndex.find(graph.files[edge.to].path);
    if (from == planIndex.end() || to == planIndex.end() || to->second >= from->second) continue;
    plan.sources[from->second].needs.push_back(to->second);
  }
  for (ExportSource& source : plan.sources) {
    std::sort(source.needs.begin(), source.needs.end());
    source.needs.erase(std::unique(source.needs.begin(), source.needs.end()), source.needs.end());
  }
  return true;
}

VerilogSettings ExportPlanner::VerilogSettingsOf(const std::map<std::string, std::string>& properties) {
  auto entries = [&properties](std::string_view name) {
    auto found = properties.find(std::string(name));
    return found == properties.end() ? std::vector<std::string>() : ListEntries(found->second);
  };
  return {entries(ProjectLoader::kIncludeDirsProperty), entries(ProjectLoader::kMacrosProperty)};
}

bool ExportPlanner::PlanProject(const std::vector<OrderEntry>& order, const TreeInfo& tree,
                                const std::vector<FileInfo>& files, const VerilogSettings& verilog,
                                const std::string& topKey, ExportPlan& plan,
                                std::vector<std::string>& leftOut, std::string& error) {
  plan = ExportPlan{{}, verilog.includeDirs, verilog.defines, std::nullopt};
  std::vector<std::string> paths;
  if (!Plan(order, FileGraph::Build(tree, order), plan, paths, error)) return false;
  for (const std::string& path : paths)
    leftOut.push_back(path + " is left out of the export: only VHDL and Verilog sources are compiled");
  if (!topKey.empty()) {
    plan.top = TopOf(topKey, files);
    if (!plan.top)
      leftOut.push_back(topKey + " is no entity, architecture or module: the export names no top");
  }
  return true;
}

std::optional<ExportTop> ExportPlanner::TopOf(const std::string& key, const std::vector<FileInfo>& files) {
  std::vector<std::string> parts = Split(key, '|');
  const bool named = parts.size() == 2 && (parts[0] == "Entity" || parts[0] == "Module");
  const bool architecture = parts.size() == 3 && parts[0] == "Architecture";
  if (!named && !architecture) return std::nullopt;
  for (const FileInfo& file : files) {
    auto holds = [&](const UnitInfo& unit) { return unit.key == key; };
    if (std::none_of(file.units.begin(), file.units.end(), holds)) continue;
    return ExportTop{file.library, parts[1], architecture ? parts[2] : std::string(), parts[0] == "Module"};
  }
  return std::nullopt;
}

}  // namespace quillon
