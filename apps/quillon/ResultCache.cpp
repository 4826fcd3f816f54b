#include "ResultCache.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cinttypes>
#include <cstdio>
#include <set>
#include <string_view>
#include <vector>

#include "CacheEntry.h"
#include "CacheFiles.h"
#include "FileList.h"
#include "InstallLayout.h"
#include "ParseCache.h"
#include "StoredRun.h"

extern char** environ;

namespace quillon {

namespace {

// Kept by shells for themselves; no run reads them.
constexpr std::string_view kShellBookkeeping[] = {"OLDPWD=", "_=", "SHLVL="};

void AddLine(std::string& key, std::string_view name, std::string_view value) {
  key.append(name).append(1, '=').append(value).append(1, '\n');
}

// What tells one build of a file from another without reading it.
std::string StatOf(const std::string& path) {
  struct stat facts {};
  if (::stat(path.c_str(), &facts) != 0) return "missing";
  return std::to_string(facts.st_size) + ' ' + std::to_string(facts.st_ino) + ' ' +
         std::to_string(facts.st_mtim.tv_sec) + '.' + std::to_string(facts.st_mtim.tv_nsec);
}

std::string ProgramPath() {
  char path[4096];
  ssize_t length = ::readlink("/proc/self/exe", path, sizeof path - 1);
  return length > 0 ? std::string(path, static_cast<std::size_t>(length)) : std::string();
}

std::string CurrentDirectory() {
  char path[4096];
  return ::getcwd(path, sizeof path) ? std::string(path) : std::string();
}

void AddEnvironment(std::string& key) {
  std::vector<std::string_view> variables;
  for (char** entry = environ; entry && *entry; ++entry) {
    std::string_view variable(*entry);
    bool bookkeeping = std::any_of(std::begin(kShellBookkeeping), std::end(kShellBookkeeping),
                                   [&](std::string_view name) { return variable.starts_with(name); });
    if (!bookkeeping) variables.push_back(variable);
  }
  std::sort(variables.begin(), variables.end());
  for (std::string_view variable : variables) AddLine(key, "env", variable);
}

bool MentionsInclude(const std::string& path) {
  std::string text;
  return !CacheFiles::Read(path, text) || text.find("`include") != std::string::npos;
}

void AddOnce(std::vector<std::string>& paths, std::set<std::string>& seen, const std::string& path) {
  if (seen.insert(path).second) paths.push_back(path);
}

// Every file and directory whose content the run's answer depends on, each once; empty when the
// answer depends on more than the key and these can tell.
std::vector<std::string> InputsOf(const ProjectSources& resolved) {
  if (resolved.consulted.patterns) return {};
  std::vector<std::string> paths;
  std::set<std::string> seen;
  for (const SourceFile& file : resolved.files) {
    if (!ParseCache::Keeps(file.plugin)) return {};
    if (ParseCache::IsVerilog(file.plugin) && MentionsInclude(file.path)) return {};
    AddOnce(paths, seen, file.path);
  }
  for (const std::string& path : resolved.consulted.files) AddOnce(paths, seen, path);
  for (const std::string& path : resolved.consulted.directories) AddOnce(paths, seen, path);
  for (const SourceFile& file : resolved.librarySearch.files)
    AddOnce(paths, seen, FileList::Resolved(file.path, ""));
  for (const SourceFile& directory : resolved.librarySearch.directories)
    AddOnce(paths, seen, FileList::Resolved(directory.path, ""));
  return paths;
}

}  // namespace

ResultCache::ResultCache(std::string directory, const Options& options)
    : directory_(std::move(directory)), key_(KeyOf(options)) {}

bool ResultCache::Applies(const Options& options) {
  bool answers = options.command != Command::kWatch && options.command != Command::kFactories;
  bool fromStandardInput =
      std::any_of(options.sources.begin(), options.sources.end(),
                  [](const SourceArgument& a) { return a.path == FileList::kStandardInput; });
  return answers && !fromStandardInput && options.outputPath.empty() && !options.arguments.empty();
}

std::string ResultCache::KeyOf(const Options& options) {
  std::string key;
  std::string program = ProgramPath(), module = InstallLayout::ModulePath();
  AddLine(key, "program", program + ' ' + StatOf(program));
  AddLine(key, "module", module + ' ' + StatOf(module));
  AddLine(key, "data", InstallLayout::InstalledDataDir().value_or(""));
  AddLine(key, "cwd", CurrentDirectory());
  for (const std::string& argument : options.arguments) AddLine(key, "arg", argument);
  AddEnvironment(key);
  AddLine(key, "terminals",
          std::to_string(::isatty(STDOUT_FILENO)) + std::to_string(::isatty(STDERR_FILENO)) +
              std::to_string(OutputCapture::OutputsShared()));
  return key;
}

std::string ResultCache::EntryPath() const {
  char name[40];
  std::snprintf(name, sizeof name, "run-%016" PRIx64 ".qrr", CacheEntry::Hash(key_));
  return directory_ + '/' + name;
}

std::optional<ResultCache::Answer> ResultCache::Lookup() const {
  std::string bytes;
  StoredRun run;
  if (!CacheFiles::Read(EntryPath(), bytes) || !run.Decode(bytes) || run.key != key_) return std::nullopt;
  for (const InputStamp& input : run.inputs)
    if (!input.Holds()) return std::nullopt;
  return Answer{run.status, std::move(run.output)};
}

void ResultCache::Store(const ProjectSources& resolved, std::int64_t runStart, int status,
                        const OutputCapture::Captured& output) const {
  std::vector<std::string> paths = InputsOf(resolved);
  if (paths.empty()) return;
  StoredRun run{key_, {}, status, output};
  for (const std::string& path : paths) {
    std::optional<InputStamp> stamp = InputStamp::Take(path, runStart);
    if (!stamp) return;
    run.inputs.push_back(std::move(*stamp));
  }
  CacheFiles::Write(directory_, EntryPath(), run.Encode());
}

}  // namespace quillon
