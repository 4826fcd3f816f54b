#include "Watcher.h"

#include <poll.h>
#include <signal.h>
#include <sys/inotify.h>
#include <sys/signalfd.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <nlohmann/json.hpp>
#include <sstream>
#include <tuple>

#include "CommandRunner.h"
#include "ExitStatus.h"
#include "FileFacts.h"
#include "HdlSets.h"
#include "Host/HostComponents.h"
#include "LibraryResolver.h"
#include "MessageLog.h"
#include "OutputCapture.h"
#include "ParseCache.h"
#include "Port/File.h"
#include "Port/FileName.h"
#include "ProjectLoader.h"
#include "ProjectReader.h"

namespace quillon {

namespace {

// Editors save in several steps; events this close together are taken as one change.
constexpr int kSettleMilliseconds = 15;
constexpr std::uint32_t kWatchedEvents =
    IN_CLOSE_WRITE | IN_MOVED_TO | IN_MOVED_FROM | IN_CREATE | IN_DELETE | IN_ATTRIB;

sigset_t EndingSignals() {
  sigset_t set;
  sigemptyset(&set);
  sigaddset(&set, SIGINT);
  sigaddset(&set, SIGTERM);
  return set;
}

std::string Canonical(const std::string& path) {
  Port::StringBase canonical(path);
  Port::FileName::MakeCanonical(&canonical, nullptr);
  return canonical.str();
}

std::string WithoutTrailingSlashes(std::string path) {
  while (path.size() > 1 && path.back() == '/') path.pop_back();
  return path.empty() ? std::string(".") : path;
}

std::string DirectoryOf(const std::string& path) {
  return WithoutTrailingSlashes(Port::FileName::GetHead(path).str());
}

bool SameMessage(const Port_MsgRecord& a, const Port_MsgRecord& b) {
  return a.type == b.type && a.text == b.text && a.category == b.category && a.sourceFile == b.sourceFile &&
         a.line == b.line && a.revision == b.revision && a.number == b.number;
}

auto FieldsOf(const UnitInfo& u) {
  return std::tie(u.type, u.name, u.key, u.storeKey, u.line, u.parent, u.inGenerate, u.unitFlag, u.partition,
                  u.entity, u.architecture, u.component, u.library, u.package, u.item, u.uses);
}

bool SameUnit(const UnitInfo& a, const UnitInfo& b) { return FieldsOf(a) == FieldsOf(b); }

// The file's records with their store keys replaced by numbers in order of first appearance.
std::vector<UnitInfo> UnitsWithNumberedKeys(Vad::IHdlFile* file) {
  std::vector<UnitInfo> units = ProjectReader::UnitsOf(file);
  std::map<std::string, std::string> numbers;
  auto renumber = [&](std::string& key) {
    key = numbers.emplace(key, std::to_string(numbers.size())).first->second;
  };
  for (UnitInfo& unit : units) renumber(unit.storeKey);
  for (UnitInfo& unit : units) {
    if (unit.parent) renumber(*unit.parent);
    if (unit.uses)
      for (std::string& used : *unit.uses) renumber(used);
  }
  return units;
}

// The messages of a refresh's standard error: a line with the indented lines that continue it.
std::vector<std::string> MessagesIn(const std::string& text) {
  std::vector<std::string> messages;
  for (std::size_t start = 0; start < text.size();) {
    std::size_t end = text.find('\n', start);
    end = end == std::string::npos ? text.size() : end + 1;
    bool continues = !messages.empty() && (text[start] == ' ' || text[start] == '\t');
    if (continues) {
      messages.back().append(text, start, end - start);
    } else {
      messages.emplace_back(text, start, end - start);
    }
    start = end;
  }
  return messages;
}

}  // namespace

Watcher::Watcher(const Options& options) : options_(options) {
  options_.command = options.watchView;
  options_.noCache = true;
}

Watcher::~Watcher() {
  builder_.reset();
  if (inotify_ >= 0) ::close(inotify_);
  if (signals_ >= 0) ::close(signals_);
}

int Watcher::Run() {
  sigset_t ending = EndingSignals(), previous;
  // Taken through a descriptor, so that an ending signal is seen by the wait like any event.
  ::sigprocmask(SIG_BLOCK, &ending, &previous);
  signals_ = ::signalfd(-1, &ending, SFD_CLOEXEC);
  inotify_ = ::inotify_init1(IN_CLOEXEC);
  std::string error;
  int status = kExitDone;
  if (signals_ < 0 || inotify_ < 0) {
    std::fprintf(stderr, "quillon: the sources cannot be watched: %s\n", std::strerror(errno));
    status = kExitFailed;
  } else if (!Host::RegisterHostComponents() || !module_.Load(error)) {
    std::fprintf(stderr, "quillon: %s\n",
                 error.empty() ? "the host components cannot be registered" : error.c_str());
    status = kExitFailed;
  } else {
    ProjectBuilder::SetInstallRootWhenUnset();
    if (!Reload()) status = kExitBadInput;
  }
  if (status == kExitDone) {
    Refresh();
    for (Changes changes = Wait(); !changes.stop; changes = Wait()) {
      if (changes.reload) {
        Reload();
        Refresh();
      } else if (FollowLibrarySearch() || ParseChanged(changes.sources)) {
        Refresh();
      }
    }
  }
  builder_.reset();
  ::sigprocmask(SIG_SETMASK, &previous, nullptr);
  return status;
}

bool Watcher::Reload() {
  builder_.reset();
  loaded_ = ProjectSources();
  std::string error;
  if (!ProjectLoader(loaded_).Load(options_, error)) {
    std::fprintf(stderr, "quillon: %s\n", error.c_str());
    sources_ = loaded_;
    WatchPaths();
    return false;
  }
  return Build(loaded_);
}

bool Watcher::SearchLibraries(ProjectSources& sources, std::string& error) {
  const ProjectSources::LibrarySearch& search = sources.librarySearch;
  if (search.directories.empty() && search.files.empty()) return true;
  // The module's messages about the files looked at belong to the refresh proper.
  MessageLog hidden(true, false, false);
  return LibraryResolver(sources).Resolve(error);
}

bool Watcher::Build(ProjectSources sources) {
  builder_.reset();
  parsed_.clear();
  std::string error;
  auto builder = std::make_unique<ProjectBuilder>();
  if (SearchLibraries(sources, error) && builder->Build(sources, error)) {
    builder_ = std::move(builder);
  } else {
    std::fprintf(stderr, "quillon: %s\n", error.c_str());
  }
  sources_ = std::move(sources);
  WatchPaths();
  return builder_ != nullptr;
}

bool Watcher::FollowLibrarySearch() {
  const ProjectSources::LibrarySearch& search = loaded_.librarySearch;
  if (!builder_ || (search.directories.empty() && search.files.empty())) return false;
  ProjectSources searched = loaded_;
  std::string error;
  if (!SearchLibraries(searched, error)) return false;  // the refresh reports it
  auto paths = [](const ProjectSources& sources) {
    std::vector<std::string> paths;
    for (const SourceFile& file : sources.files) paths.push_back(file.path);
    return paths;
  };
  if (paths(searched) == paths(sources_)) return false;
  Build(std::move(searched));
  return true;
}

void Watcher::WatchPaths() {
  sourcePaths_.clear();
  settingPaths_.clear();
  libraryDirectories_.clear();
  for (const SourceFile& file : sources_.files) sourcePaths_.insert(file.path);
  for (const SourceArgument& argument : options_.sources) {
    // Until a missing source is back, any change of the arguments may be the one that brings it.
    if (argument.kind != SourceArgument::Kind::kFile || !builder_)
      settingPaths_.insert(Canonical(argument.path));
  }
  for (const SourceFile& directory : sources_.librarySearch.directories)
    libraryDirectories_.insert(WithoutTrailingSlashes(directory.path));
  WatchDirectories();
}

void Watcher::WatchDirectories() {
  std::set<std::string> directories;
  for (const std::string& path : sourcePaths_) directories.insert(DirectoryOf(path));
  for (const std::string& path : settingPaths_) directories.insert(DirectoryOf(path));
  directories.insert(libraryDirectories_.begin(), libraryDirectories_.end());
  for (const std::string& directory : directories) {
    int descriptor = ::inotify_add_watch(inotify_, directory.c_str(), kWatchedEvents);
    if (descriptor >= 0) directories_[descriptor] = directory;
  }
}

void Watcher::Refresh() {
  if (!builder_) return;
  std::ostringstream out;
  CommandRunner runner(options_);
  OutputCapture capture;
  bool captured = capture.Begin();
  runner.RunOn(builder_->project(), sources_, out);
  OutputCapture::Captured written = capture.End();
  if (captured) ShowNewMessages(written.out + written.err);
  std::string text = out.str();
  if (options_.format == Format::kJson) {
    nlohmann::json answer = nlohmann::json::parse(text, nullptr, false);
    if (!answer.is_discarded()) text = answer.dump() + '\n';
  }
  if (text == lastOutput_) return;
  lastOutput_ = text;
  std::fwrite(text.data(), 1, text.size(), stdout);
  std::fflush(stdout);
}

void Watcher::ShowNewMessages(const std::string& text) {
  std::set<std::string> shown;
  for (std::string& message : MessagesIn(text)) {
    if (!shownMessages_.count(message)) std::fwrite(message.data(), 1, message.size(), stderr);
    shown.insert(std::move(message));
  }
  shownMessages_ = std::move(shown);
}

Watcher::Changes Watcher::Wait() {
  Changes changes;
  pollfd waits[2] = {{signals_, POLLIN, 0}, {inotify_, POLLIN, 0}};
  int timeout = -1;  // the first event is waited for without end, the rest a short while
  while (!changes.stop) {
    int ready = ::poll(waits, 2, timeout);
    if (ready < 0 && errno == EINTR) continue;
    if (ready <= 0) break;
    if (waits[0].revents) {
      // Taken off the pending set, so that restoring the signal mask does not deliver it again.
      signalfd_siginfo taken;
      [[maybe_unused]] ssize_t size = ::read(signals_, &taken, sizeof taken);
      changes.stop = true;
    }
    if (waits[1].revents) Take(changes);
    bool anything = changes.reload || changes.search || !changes.sources.empty();
    if (anything) timeout = kSettleMilliseconds;
  }
  return changes;
}

void Watcher::Take(Changes& changes) {
  alignas(inotify_event) char buffer[16 * 1024];
  ssize_t length = ::read(inotify_, buffer, sizeof buffer);
  for (ssize_t at = 0; length > 0 && at < length;) {
    const auto* event = reinterpret_cast<const inotify_event*>(buffer + at);
    at += static_cast<ssize_t>(sizeof(inotify_event) + event->len);
    if (event->mask & IN_Q_OVERFLOW) {
      changes.reload = true;
      continue;
    }
    auto directory = directories_.find(event->wd);
    if (directory == directories_.end() || event->len == 0) continue;
    std::string path = directory->second + '/' + event->name;
    if (settingPaths_.count(path)) changes.reload = true;
    if (libraryDirectories_.count(directory->second)) changes.search = true;
    if (!sourcePaths_.count(path)) continue;
    if (event->mask & (IN_DELETE | IN_MOVED_FROM)) changes.reload = true;
    changes.sources.insert(path);
  }
}

std::vector<Vad::IHdlFile*> Watcher::FilesAt(const std::set<std::string>& paths) const {
  std::vector<Vad::IHdlFile*> found;
  Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
  if (auto* set = Prjrep::QueryAs<Vad::IHdlFileSet>(builder_->project())) set->CreateIterator(files.Out());
  if (!files) return found;
  for (files->First(); !files->IsDone(); files->Next()) {
    Vad::IHdlFile* file = files->Current();
    if (file && paths.count(FileFacts::PathOf(file))) found.push_back(file);
  }
  return found;
}

bool Watcher::Parsed::operator==(const Parsed& other) const {
  return std::equal(units.begin(), units.end(), other.units.begin(), other.units.end(), SameUnit) &&
         messages.size() == other.messages.size() &&
         std::equal(messages.begin(), messages.end(), other.messages.begin(), SameMessage);
}

// A VHDL file is parsed here on its own, quietly, to see whether the edit changed anything the
// answer is made of. Verilog files are parsed together with the others and always count as changed.
bool Watcher::ParseChanged(const std::set<std::string>& paths) {
  if (!builder_ || paths.empty()) return false;
  std::vector<Vad::IHdlFile*> files = FilesAt(paths);
  bool changed = false;
  for (Vad::IHdlFile* file : files) {
    OrderEntry described = FileFacts::Describe(file);
    file->setNeedsParse(true);
    Parsed now;
    if (!ParseCache::Keeps(described.plugin) || ParseCache::IsVerilog(described.plugin)) {
      changed = true;
      continue;
    }
    {
      MessageLog hidden(true, false, false);
      file->parseIfNeeded();
      now.messages = hidden.received();
    }
    now.units = UnitsWithNumberedKeys(file);
    auto before = parsed_.find(described.path);
    if (before == parsed_.end() || !(before->second == now)) changed = true;
    parsed_[described.path] = std::move(now);
  }
  // The refresh parses them once more, so that their messages are part of its answer.
  if (changed)
    for (Vad::IHdlFile* file : files) file->setNeedsParse(true);
  return changed;
}

}  // namespace quillon
