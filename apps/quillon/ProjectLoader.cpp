#include "ProjectLoader.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <sstream>

#include "PluginTable.h"
#include "Port/File.h"
#include "Port/FileName.h"

namespace quillon {

namespace {

constexpr std::string_view kIncdirPrefix = "+incdir+";
constexpr std::string_view kDefinePrefix = "+define+";
constexpr const char* kDefaultLibrary = "work";

bool ReadWholeFile(const std::string& path, std::string& text) {
  if (Port::File::isDirectory(path.c_str())) return false;
  std::ifstream in(path, std::ios::binary);
  if (!in) return false;
  text.assign(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
  return !in.bad();
}

std::string Canonical(std::string path, const std::string& baseDir) {
  Port::StringBase canonical(std::move(path));
  Port::FileName::MakeCanonical(&canonical, baseDir.empty() ? nullptr : baseDir.c_str());
  return canonical.str();
}

std::string DirectoryOf(const std::string& path) {
  std::string head = Port::FileName::GetHead(path).str();
  return head.empty() ? std::string(".") : head;
}

// The text of the parse error without the library's "[json.exception...] " lead.
std::string ShortJsonReason(const nlohmann::json::exception& failure) {
  std::string reason = failure.what();
  std::size_t lead = reason.find("] ");
  return lead == std::string::npos ? reason : reason.substr(lead + 2);
}

std::string Trimmed(std::string_view text) {
  constexpr std::string_view kBlanks = " \t\r\n";
  std::size_t first = text.find_first_not_of(kBlanks);
  if (first == std::string_view::npos) return {};
  std::size_t last = text.find_last_not_of(kBlanks);
  return std::string(text.substr(first, last - first + 1));
}

std::vector<std::string> PlusSeparated(std::string_view list) {
  std::vector<std::string> pieces;
  std::size_t start = 0;
  while (start <= list.size()) {
    std::size_t plus = list.find('+', start);
    if (plus == std::string_view::npos) plus = list.size();
    if (plus > start) pieces.emplace_back(list.substr(start, plus - start));
    start = plus + 1;
  }
  return pieces;
}

// Reads an optional text member; false when it is there but is no string.
bool OptionalText(const nlohmann::json& object, const char* name, std::string& out) {
  auto member = object.find(name);
  if (member == object.end()) return true;
  if (!member->is_string()) return false;
  out = member->get<std::string>();
  return true;
}

}  // namespace

bool ProjectLoader::Load(const Options& options, std::string& error) {
  for (const SourceArgument& argument : options.sources) {
    bool added = false;
    switch (argument.kind) {
      case SourceArgument::Kind::kFile:
        added = AddSource(argument.path, "", argument.library, argument.plugin, error);
        break;
      case SourceArgument::Kind::kProjectFile:
        added = AddProjectFile(argument, error);
        break;
      case SourceArgument::Kind::kFileList:
        added = AddFileList(argument, error);
        break;
    }
    if (!added) return false;
  }
  for (const std::string& define : options.defines) AddDefine(define);
  for (const std::string& directory : options.includeDirs) AddIncludeDir(directory);
  if (options.target) sources_.properties[std::string(kTargetProperty)] = *options.target;
  if (options.family) sources_.properties[std::string(kFamilyProperty)] = *options.family;
  for (const auto& [name, value] : options.properties) sources_.properties[name] = value;
  return true;
}

bool ProjectLoader::AddSource(std::string path, const std::string& baseDir, std::string library,
                              std::string plugin, std::string& error) {
  std::string fullPath = Canonical(std::move(path), baseDir);
  if (!Port::File::exist(fullPath.c_str())) {
    error = "no such source file: " + fullPath;
    return false;
  }
  if (Port::File::isDirectory(fullPath.c_str())) {
    error = fullPath + " is a directory, not a source file";
    return false;
  }
  if (!std::ifstream(fullPath)) {
    error = "cannot read source file " + fullPath;
    return false;
  }
  if (library.empty()) library = kDefaultLibrary;
  if (plugin.empty()) plugin = PluginTable::PluginForPath(fullPath);
  sources_.files.push_back({std::move(fullPath), std::move(library), std::move(plugin)});
  return true;
}

bool ProjectLoader::AddProjectFile(const SourceArgument& argument, std::string& error) {
  std::string projectPath = Canonical(argument.path, "");
  std::string text;
  if (!ReadWholeFile(projectPath, text)) {
    error = "cannot read project file " + projectPath;
    return false;
  }
  nlohmann::json project;
  try {
    project = nlohmann::json::parse(text);
  } catch (const nlohmann::json::exception& failure) {
    error = projectPath + " is not a valid project file: " + ShortJsonReason(failure);
    return false;
  }
  auto malformed = [&](const std::string& what) {
    error = projectPath + " is not a valid project file: " + what;
    return false;
  };
  if (!project.is_object()) return malformed("it must hold a JSON object");

  auto properties = project.find("properties");
  if (properties != project.end()) {
    if (!properties->is_object()) return malformed("\"properties\" must be an object");
    for (const auto& [name, value] : properties->items()) {
      if (!value.is_string()) return malformed("the value of property \"" + name + "\" must be a string");
      sources_.properties[name] = value.get<std::string>();
    }
  }

  auto external = project.find("externalLibraries");
  if (external != project.end()) {
    auto isText = [](const nlohmann::json& value) { return value.is_string(); };
    if (!external->is_array() || !std::all_of(external->begin(), external->end(), isText))
      return malformed("\"externalLibraries\" must be an array of texts");
    for (const auto& name : *external) sources_.externalLibraries.push_back(name.get<std::string>());
  }

  auto files = project.find("files");
  if (files == project.end()) return true;
  if (!files->is_array()) return malformed("\"files\" must be an array");
  std::string baseDir = DirectoryOf(projectPath);
  for (std::size_t index = 0; index < files->size(); ++index) {
    const nlohmann::json& entry = (*files)[index];
    std::string where = "files[" + std::to_string(index) + "]";
    std::string path, library = argument.library, plugin = argument.plugin;
    if (!entry.is_object() || !OptionalText(entry, "path", path) || path.empty()) {
      return malformed(where + " needs a \"path\" text");
    }
    if (!OptionalText(entry, "library", library)) return malformed(where + ": \"library\" must be a text");
    if (!OptionalText(entry, "plugin", plugin)) return malformed(where + ": \"plugin\" must be a text");
    if (!AddSource(path, baseDir, library, plugin, error)) return false;
  }
  return true;
}

bool ProjectLoader::AddFileList(const SourceArgument& argument, std::string& error) {
  std::string listPath = Canonical(argument.path, "");
  std::string text;
  if (!ReadWholeFile(listPath, text)) {
    error = "cannot read file list " + listPath;
    return false;
  }
  std::istringstream lines(text);
  std::string line;
  for (int number = 1; std::getline(lines, line); ++number) {
    if (!TakeFileListLine(line, argument, error)) {
      error = listPath + ":" + std::to_string(number) + ": " + error;
      return false;
    }
  }
  return true;
}

bool ProjectLoader::TakeFileListLine(std::string line, const SourceArgument& argument, std::string& error) {
  if (std::size_t comment = line.find("//"); comment != std::string::npos) line.erase(comment);
  line = Trimmed(line);
  if (line.empty() || line[0] == '#') return true;
  if (line.starts_with(kIncdirPrefix)) {
    for (std::string& directory : PlusSeparated(std::string_view(line).substr(kIncdirPrefix.size()))) {
      AddIncludeDir(std::move(directory));
    }
    return true;
  }
  if (line.starts_with(kDefinePrefix)) {
    for (const std::string& define : PlusSeparated(std::string_view(line).substr(kDefinePrefix.size()))) {
      AddDefine(define);
    }
    return true;
  }
  if (line[0] == '+') {
    error = "unknown list option " + line;
    return false;
  }
  std::string sourceError;
  if (!AddSource(line, "", argument.library, argument.plugin, sourceError)) {
    error = sourceError;
    return false;
  }
  return true;
}

void ProjectLoader::AddDefine(std::string_view define) { AppendToListProperty(kMacrosProperty, define); }

void ProjectLoader::AddIncludeDir(std::string directory) {
  AppendToListProperty(kIncludeDirsProperty, Canonical(std::move(directory), ""));
}

// The module reads both lists with ";" between the entries.
void ProjectLoader::AppendToListProperty(std::string_view property, std::string_view value) {
  std::string& list = sources_.properties[std::string(property)];
  if (!list.empty()) list += ';';
  list += value;
}

}  // namespace quillon
