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

#include "CommandRunner.h"
#include "ExitStatus.h"
#include "FileFacts.h"
#include "HdlSets.h"
#include "Host/HostComponents.h"
#include "Port/File.h"
#include "Port/FileName.h"
#include "ProjectLoader.h"

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

std::string DirectoryOf(const std::string& path) {
  std::string head = Port::FileName::GetHead(path).str();
  while (head.size() > 1 && head.back() == '/') head.pop_back();
  return head.empty() ? std::string(".") : head;
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
      } else {
        MarkChanged(changes.sources);
      }
      Refresh();
    }
  }
  builder_.reset();
  ::sigprocmask(SIG_SETMASK, &previous, nullptr);
  return status;
}

bool Watcher::Reload() {
  builder_.reset();
  sources_ = ProjectSources();
  std::string error;
  auto builder = std::make_unique<ProjectBuilder>();
  if (!ProjectLoader(sources_).Load(options_, error) || !builder->Build(sources_, error)) {
    std::fprintf(stderr, "quillon: %s\n", error.c_str());
  } else {
    builder_ = std::move(builder);
  }
  sourcePaths_.clear();
  settingPaths_.clear();
  for (const SourceFile& file : sources_.files) sourcePaths_.insert(file.path);
  for (const SourceArgument& argument : options_.sources) {
    // Until a missing source is back, any change of the arguments may be the one that brings it.
    if (argument.kind != SourceArgument::Kind::kFile || !builder_)
      settingPaths_.insert(Canonical(argument.path));
  }
  WatchDirectories();
  return builder_ != nullptr;
}

void Watcher::WatchDirectories() {
  std::set<std::string> directories;
  for (const std::string& path : sourcePaths_) directories.insert(DirectoryOf(path));
  for (const std::string& path : settingPaths_) directories.insert(DirectoryOf(path));
  for (const std::string& directory : directories) {
    int descriptor = ::inotify_add_watch(inotify_, directory.c_str(), kWatchedEvents);
    if (descriptor >= 0) directories_[descriptor] = directory;
  }
}

void Watcher::Refresh() {
  if (!builder_) return;
  std::ostringstream out;
  CommandRunner(options_).RunOn(builder_->project(), sources_, out);
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
    bool anything = changes.reload || !changes.sources.empty();
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
    if (!sourcePaths_.count(path)) continue;
    if (event->mask & (IN_DELETE | IN_MOVED_FROM)) changes.reload = true;
    changes.sources.insert(path);
  }
}

void Watcher::MarkChanged(const std::set<std::string>& paths) {
  if (!builder_ || paths.empty()) return;
  Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
  if (auto* set = Prjrep::QueryAs<Vad::IHdlFileSet>(builder_->project())) set->CreateIterator(files.Out());
  if (!files) return;
  for (files->First(); !files->IsDone(); files->Next()) {
    Vad::IHdlFile* file = files->Current();
    if (file && paths.count(FileFacts::PathOf(file))) file->setNeedsParse(true);
  }
}

}  // namespace quillon
