#include "ProjectLoader.h"

#include <sys/stat.h>

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <sstream>

#include "PluginTable.h"
#include "Port/File.h"
#include "Port/FileName.h"
#include "Port/InputLimits.h"

namespace quillon {

namespace {

constexpr std::string_view kIncdirPrefix = "+incdir+";
constexpr std::string_view kDefinePrefix = "+define+";
constexpr const char* kDefaultLibrary = "work";

std::string Formatted(const char* format, const std::string& path, std::uint64_t limit) {
  return Port::StringBase().Format(format, path.c_str(), static_cast<unsigned long long>(limit)).str();
}

// A regular file no larger than `maxBytes`: a pipe or device could block or never end. Empty
// `error` when the file is not there at all, so that the caller can say so in its own words.
bool IsReadableRegularFile(const std::string& path, std::uint64_t maxBytes, const char* tooLarge,
                           std::string& error) {
  struct stat facts {};
  if (::stat(path.c_str(), &facts) != 0) return false;
  if (S_ISDIR(facts.st_mode)) return false;
  if (!S_ISREG(facts.st_mode)) {
    error = Formatted(Port::InputLimits::kNotRegularFile, path, 0);
    return false;
  }
  if (static_cast<std::uint64_t>(facts.st_size) > maxBytes) {
    error = Formatted(tooLarge, path, maxBytes);
    return false;
  }
  return true;
}

// The whole of a project file or file list. False with an empty `error` when it cannot be opened
// or read.
bool ReadWholeFile(const std::string& path, std::string& text, std::string& error) {
  using namespace Port::InputLimits;
  if (!IsReadableRegularFile(path, kMaxListBytes, kListTooLarge, error)) return false;
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

// A "//" starts a comment at the start of a line or after a blank; inside a path ("dir//a.vhd")
// it is part of the path.
std::size_t CommentStart(const std::string& line) {
  for (std::size_t at = line.find("//"); at != std::string::npos; at = line.find("//", at + 1)) {
    if (at == 0 || line[at - 1] == ' ' || line[at - 1] == '\t') return at;
  }
  return line.size();
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
  if (options.converterTimeout) {
    sources_.properties[Port::InputLimits::kConverterTimeoutProperty] =
        std::to_string(*options.converterTimeout);
  }
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
  using namespace Port::InputLimits;
  if (!IsReadableRegularFile(fullPath, kMaxSourceBytes, kSourceTooLarge, error) && !error.empty())
    return false;
  if (!std::ifstream(fullPath)) {
    error = "cannot read source file " + fullPath;
    return false;
  }
  if (!seen_.insert(fullPath).second) {
    sources_.warnings.push_back(fullPath + " is given more than once; it is read once");
    return true;
  }
  if (library.empty()) library = kDefaultLibrary;
  if (plugin.empty()) plugin = PluginTable::PluginForPath(fullPath);
  sources_.files.push_back({std::move(fullPath), std::move(library), std::move(plugin)});
  return true;
}

bool ProjectLoader::AddProjectFile(const SourceArgument& argument, std::string& error) {
  std::string projectPath = Canonical(argument.path, "");
  std::string text;
  if (!ReadWholeFile(projectPath, text, error)) {
    if (error.empty()) error = "cannot read project file " + projectPath;
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
    if (path.find('\0') != std::string::npos) return malformed(where + ": the path holds a NUL character");
    if (!OptionalText(entry, "library", library)) return malformed(where + ": \"library\" must be a text");
    if (!OptionalText(entry, "plugin", plugin)) return malformed(where + ": \"plugin\" must be a text");
    if (!AddSource(path, baseDir, library, plugin, error)) return false;
  }
  return true;
}

bool ProjectLoader::AddFileList(const SourceArgument& argument, std::string& error) {
  std::string listPath = Canonical(argument.path, "");
  std::string text;
  if (!ReadWholeFile(listPath, text, error)) {
    if (error.empty()) error = "cannot read file list " + listPath;
    return false;
  }
  constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
  if (text.starts_with(kByteOrderMark)) text.erase(0, kByteOrderMark.size());
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
  line.erase(CommentStart(line));
  line = Trimmed(line);
  if (line.empty() || line[0] == '#') return true;
  if (line.starts_with(kIncdirPrefix) || line.starts_with(kDefinePrefix)) {
    const bool isDefine = line.starts_with(kDefinePrefix);
    std::vector<std::string> values =
        PlusSeparated(std::string_view(line).substr((isDefine ? kDefinePrefix : kIncdirPrefix).size()));
    for (std::string& value : values) {
      if (!Options::FitsList(value)) {
        error = "'" + value + "' holds a ';', which would separate it into more than one entry";
        return false;
      }
      if (isDefine) {
        AddDefine(value);
      } else {
        AddIncludeDir(std::move(value));
      }
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
