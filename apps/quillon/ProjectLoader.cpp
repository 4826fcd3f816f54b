#include "ProjectLoader.h"

#include <fcntl.h>
#include <glob.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <optional>

#include "PluginTable.h"
#include "Port/File.h"
#include "Port/FileName.h"
#include "Port/InputLimits.h"

namespace quillon {

namespace {

constexpr const char* kDefaultLibrary = "work";

std::string Formatted(const char* format, const std::string& path, std::uint64_t limit) {
  return Port::StringBase().Format(format, path.c_str(), static_cast<unsigned long long>(limit)).str();
}

// A regular file no larger than `maxBytes`, as `facts` (its stat) tell: a pipe or device could
// block or never end.
bool IsSmallRegularFile(const std::string& path, const struct stat& facts, std::uint64_t maxBytes,
                        const char* tooLarge, std::string& error) {
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

// As IsSmallRegularFile; an empty `error` when the file is not there at all or is a directory, so
// that the caller can say so in its own words.
bool IsReadableRegularFile(const std::string& path, std::uint64_t maxBytes, const char* tooLarge,
                           std::string& error) {
  struct stat facts {};
  if (::stat(path.c_str(), &facts) != 0 || S_ISDIR(facts.st_mode)) return false;
  return IsSmallRegularFile(path, facts, maxBytes, tooLarge, error);
}

bool CanOpenForReading(const std::string& path) {
  int descriptor = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) return false;
  ::close(descriptor);
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

// The HDL sources that a directory on the command line stands for.
bool IsHdlSource(const std::filesystem::path& path) {
  std::string extension = path.extension().string();
  std::transform(extension.begin(), extension.end(), extension.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return extension == ".vhd" || extension == ".vhdl" || extension == ".v" || extension == ".sv";
}

// The HDL files under `directory`, sorted so that runs are repeatable; the paths start with
// `directory` as given.
std::vector<std::string> HdlFilesUnder(const std::string& directory, std::vector<std::string>& listed,
                                       std::string& error) {
  namespace fs = std::filesystem;
  std::vector<std::string> files;
  std::error_code failure;
  listed.push_back(directory);
  fs::recursive_directory_iterator walk(directory, fs::directory_options::skip_permission_denied, failure);
  for (; !failure && walk != fs::recursive_directory_iterator(); walk.increment(failure)) {
    if (walk->is_directory(failure)) listed.push_back(walk->path().string());
    if (walk->is_regular_file(failure) && IsHdlSource(walk->path())) files.push_back(walk->path().string());
  }
  if (failure) error = "cannot read the directory " + directory + ": " + failure.message();
  std::sort(files.begin(), files.end());
  return files;
}

bool IsGlobPattern(const std::string& text) { return text.find_first_of("*?[") != std::string::npos; }

// The matches of a pattern, sorted; false when glob(3) fails or nothing matches.
bool GlobMatches(const std::string& pattern, std::vector<std::string>& matches) {
  glob_t found{};
  int status = ::glob(pattern.c_str(), 0, nullptr, &found);
  if (status == 0) matches.assign(found.gl_pathv, found.gl_pathv + found.gl_pathc);
  ::globfree(&found);
  return status == 0 && !matches.empty();
}

std::optional<std::string> EnvironmentValue(const std::string& name) {
  const char* value = std::getenv(name.c_str());
  return value ? std::optional<std::string>(value) : std::nullopt;
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

ProjectLoader::ProjectLoader(ProjectSources& sources)
    : sources_(sources),
      lists_(
          [&sources](const std::string& path, std::string& text, std::string& error) {
            sources.consulted.files.push_back(path);
            return ReadWholeFile(path, text, error);
          },
          EnvironmentValue, std::cin) {}

bool ProjectLoader::Load(const Options& options, std::string& error) {
  for (const SourceArgument& argument : options.sources) {
    if (!AddArgument(argument, error)) return false;
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

bool ProjectLoader::AddArgument(const SourceArgument& argument, std::string& error) {
  using Kind = SourceArgument::Kind;
  switch (argument.kind) {
    case Kind::kFile:
      return AddGiven(argument.path, argument.library, argument.plugin, error);
    case Kind::kProjectFile:
      return AddProjectFile(argument, error);
    case Kind::kFileList:
    case Kind::kFileListRelative:
      return AddFileList(argument, error);
    case Kind::kLibraryDir:
    case Kind::kLibraryFile: {
      FileList::Contents contents;
      auto& places = argument.kind == Kind::kLibraryDir ? contents.libraryDirs : contents.libraryFiles;
      places.push_back({FileList::Resolved(argument.path, ""), argument.library, argument.plugin, ""});
      return TakeListContents(std::move(contents), error);
    }
  }
  return false;
}

bool ProjectLoader::AddGiven(const std::string& given, const std::string& library, const std::string& plugin,
                             std::string& error) {
  if (given.starts_with('+')) {
    FileList::Contents contents;
    return FileList::TakePlusOption(given, "", "", contents, error) &&
           TakeListContents(std::move(contents), error);
  }
  if (!IsGlobPattern(given) || Port::File::exist(given.c_str())) {
    return AddPathOrDirectory(given, library, plugin, error);
  }
  std::vector<std::string> matches;
  sources_.consulted.patterns = true;
  if (!GlobMatches(given, matches)) {
    error = "no file matches the pattern " + given;
    return false;
  }
  for (const std::string& match : matches) {
    if (!AddPathOrDirectory(match, library, plugin, error)) return false;
  }
  return true;
}

bool ProjectLoader::AddPathOrDirectory(const std::string& given, const std::string& library,
                                       const std::string& plugin, std::string& error) {
  if (!Port::File::isDirectory(given.c_str())) return AddSource(given, library, plugin, error);
  std::vector<std::string> files = HdlFilesUnder(given, sources_.consulted.directories, error);
  if (!error.empty()) return false;
  if (files.empty()) sources_.warnings.push_back("the directory " + given + " holds no HDL source");
  for (const std::string& file : files) {
    if (!AddSource(file, library, plugin, error)) return false;
  }
  return true;
}

bool ProjectLoader::AddSource(const std::string& given, std::string library, std::string plugin,
                              std::string& error) {
  std::string fullPath = Canonical(given, "");
  // One stat answers every question about the file: projects list thousands of them.
  struct stat facts {};
  if (fullPath.empty() || ::stat(fullPath.c_str(), &facts) != 0) {
    error = "no such source file: " + fullPath;
    return false;
  }
  if (S_ISDIR(facts.st_mode)) {
    error = fullPath + " is a directory, not a source file";
    return false;
  }
  using namespace Port::InputLimits;
  if (!IsSmallRegularFile(fullPath, facts, kMaxSourceBytes, kSourceTooLarge, error)) return false;
  if (!CanOpenForReading(fullPath)) {
    error = "cannot read source file " + fullPath;
    return false;
  }
  if (!seen_.insert(fullPath).second) {
    sources_.warnings.push_back(fullPath + " is given more than once; it is read once");
    return true;
  }
  if (library.empty()) library = kDefaultLibrary;
  const bool byExtension = plugin.empty();
  if (byExtension) plugin = PluginTable::PluginForPath(fullPath);
  sources_.files.push_back({std::move(fullPath), FileList::Resolved(given, ""), std::move(library),
                            std::move(plugin), byExtension});
  return true;
}

bool ProjectLoader::AddProjectFile(const SourceArgument& argument, std::string& error) {
  std::string projectPath = Canonical(argument.path, "");
  std::string text;
  sources_.consulted.files.push_back(projectPath);
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
  std::string baseDir = DirectoryOf(argument.path);
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
    if (!AddSource(FileList::Resolved(path, baseDir), library, plugin, error)) return false;
  }
  return true;
}

bool ProjectLoader::AddFileList(const SourceArgument& argument, std::string& error) {
  FileList::Contents contents;
  return lists_.Read(argument.path, argument.kind == SourceArgument::Kind::kFileListRelative,
                     argument.library, argument.plugin, contents, error) &&
         TakeListContents(std::move(contents), error);
}

bool ProjectLoader::TakeListContents(FileList::Contents contents, std::string& error) {
  for (std::string& warning : contents.warnings) sources_.warnings.push_back(std::move(warning));
  for (const std::string& define : contents.defines) AddDefine(define);
  for (std::string& directory : contents.includeDirs) AddIncludeDir(std::move(directory));
  ProjectSources::LibrarySearch& search = sources_.librarySearch;
  for (std::string& extension : contents.libraryExtensions) search.extensions.push_back(std::move(extension));
  auto place = [](const FileList::Entry& entry) {
    return SourceFile{Canonical(entry.path, ""), entry.path,
                      entry.library.empty() ? kDefaultLibrary : entry.library, entry.plugin};
  };
  for (const FileList::Entry& entry : contents.libraryDirs) {
    search.directories.push_back(place(entry));
    if (!Port::File::isDirectory(search.directories.back().path.c_str())) {
      error = entry.where + "no such library directory: " + entry.path;
      return false;
    }
  }
  for (const FileList::Entry& entry : contents.libraryFiles) {
    search.files.push_back(place(entry));
    if (!IsReadableRegularFile(search.files.back().path, Port::InputLimits::kMaxSourceBytes,
                               Port::InputLimits::kSourceTooLarge, error)) {
      if (error.empty()) error = "no such library file: " + entry.path;
      error = entry.where + error;
      return false;
    }
  }
  for (const FileList::Entry& source : contents.sources) {
    if (!AddGiven(source.path, source.library, source.plugin, error)) {
      error = source.where + error;
      return false;
    }
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
