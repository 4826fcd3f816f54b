#include "LibraryResolver.h"

#include <filesystem>

#include "FileList.h"
#include "PluginTable.h"
#include "Progress.h"
#include "ProjectBuilder.h"
#include "ProjectReader.h"

namespace quillon {

namespace {

constexpr const char* kModuleType = "Module";
constexpr const char* kInstanceType = "ComponentInstantiation";

// Without +libext+, the extensions of Verilog sources.
const std::vector<std::string> kDefaultExtensions = {".v", ".sv"};

bool IsRegularFile(const std::string& path) {
  std::error_code failure;
  return std::filesystem::is_regular_file(path, failure);
}

SourceFile WithDefaults(SourceFile file) {
  if (file.plugin.empty()) file.plugin = PluginTable::PluginForPath(file.path);
  return file;
}

}  // namespace

bool LibraryResolver::Resolve(std::string& error) {
  if (!OfferLibraryFileModules(error)) return false;
  std::set<std::string> taken, lookedUp;
  for (const SourceFile& file : sources_.files) taken.insert(file.path);
  std::vector<SourceFile> toScan = sources_.files;
  while (!toScan.empty()) {
    std::vector<FileInfo> found;
    if (!Scan(toScan, found, error)) return false;
    Define(found);
    toScan.clear();
    for (const FileInfo& file : found) {
      for (const UnitInfo& unit : file.units) {
        const std::string name = unit.component.value_or("");
        if (unit.type != kInstanceType || defined_.count(name) || !lookedUp.insert(name).second) continue;
        std::optional<SourceFile> definer = Find(name);
        if (!definer || !taken.insert(definer->path).second) continue;
        // The other modules of a -v file come with it.
        for (const std::string& module : modulesOfFile_[definer->path]) defined_.insert(module);
        toScan.push_back(*definer);
        sources_.files.push_back(WithDefaults(*definer));
      }
    }
  }
  return true;
}

bool LibraryResolver::Scan(const std::vector<SourceFile>& files, std::vector<FileInfo>& found,
                           std::string& error) const {
  ProjectSources probe;
  probe.properties = sources_.properties;
  for (const SourceFile& file : files) probe.files.push_back(WithDefaults(file));
  ProjectBuilder builder;
  if (!builder.Build(probe, error)) return false;
  Progress silent(true, 0);
  ProjectReader reader(builder.project(), silent);
  // A file that does not parse is reported by the run proper; here it simply defines nothing.
  reader.Parse();
  found = reader.Files(ProjectReader::UnitFields::kWithoutLinks);
  return true;
}

bool LibraryResolver::OfferLibraryFileModules(std::string& error) {
  const std::vector<SourceFile>& files = sources_.librarySearch.files;
  if (files.empty()) return true;
  std::vector<FileInfo> found;
  if (!Scan(files, found, error)) return false;
  std::map<std::string, const SourceFile*> byPath;
  for (const SourceFile& file : files) byPath[file.path] = &file;
  for (const FileInfo& info : found) {
    auto file = byPath.find(info.path);
    if (file == byPath.end()) continue;
    for (const UnitInfo& unit : info.units) {
      if (unit.type != kModuleType) continue;
      offered_.emplace(unit.name, *file->second);
      modulesOfFile_[info.path].push_back(unit.name);
    }
  }
  return true;
}

std::optional<SourceFile> LibraryResolver::Find(const std::string& name) const {
  if (auto offer = offered_.find(name); offer != offered_.end()) return offer->second;
  const ProjectSources::LibrarySearch& search = sources_.librarySearch;
  const std::vector<std::string>& extensions =
      search.extensions.empty() ? kDefaultExtensions : search.extensions;
  for (const SourceFile& directory : search.directories) {
    for (const std::string& extension : extensions) {
      std::string fileName = name + extension;
      std::string fullPath = (std::filesystem::path(directory.path) / fileName).string();
      if (IsRegularFile(fullPath)) {
        return SourceFile{fullPath, FileList::Resolved(fileName, directory.givenPath), directory.library,
                          directory.plugin};
      }
    }
  }
  return std::nullopt;
}

void LibraryResolver::Define(const std::vector<FileInfo>& files) {
  for (const FileInfo& file : files) {
    for (const UnitInfo& unit : file.units) {
      if (unit.type == kModuleType) defined_.insert(unit.name);
    }
  }
}

}  // namespace quillon
