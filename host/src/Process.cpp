#include "Port/Process.h"

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Port/CommandLine.h"

extern char** environ;

namespace Port {

namespace {

// Owns one descriptor.
class Descriptor {
 public:
  Descriptor() = default;
  explicit Descriptor(int fd) : fd_(fd) {}
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  ~Descriptor() { Close(); }

  int get() const { return fd_; }
  void Reset(int fd) {
    Close();
    fd_ = fd;
  }
  void Close() {
    if (fd_ >= 0) ::close(fd_);
    fd_ = -1;
  }

 private:
  int fd_ = -1;
};

struct OutputPipe {
  Descriptor readEnd;
  Descriptor writeEnd;

  bool Open() {
    int ends[2];
    if (::pipe2(ends, O_CLOEXEC) != 0) return false;
    readEnd.Reset(ends[0]);
    writeEnd.Reset(ends[1]);
    return true;
  }
};

// posix_spawn's attribute and file-action objects, released on every path.
class SpawnSetup {
 public:
  SpawnSetup() {
    attributesReady_ = ::posix_spawnattr_init(&attributes_) == 0;
    actionsReady_ = ::posix_spawn_file_actions_init(&actions_) == 0;
  }
  SpawnSetup(const SpawnSetup&) = delete;
  SpawnSetup& operator=(const SpawnSetup&) = delete;
  ~SpawnSetup() {
    if (attributesReady_) ::posix_spawnattr_destroy(&attributes_);
    if (actionsReady_) ::posix_spawn_file_actions_destroy(&actions_);
  }

  // The child starts with default signal handling and an empty signal mask (an ignored SIGPIPE
  // of the caller would otherwise be inherited), /dev/null as input, `outputFd` (when not
  // negative) as output and error, and no other descriptor of the caller.
  int Prepare(int outputFd) {
    if (!attributesReady_ || !actionsReady_) return ENOMEM;
    int error = ResetSignals();
    return error ? error : RedirectDescriptors(outputFd);
  }

  int Spawn(const std::vector<std::string>& arguments, pid_t* pid) {
    std::vector<char*> argv;
    for (const std::string& argument : arguments) argv.push_back(const_cast<char*>(argument.c_str()));
    argv.push_back(nullptr);
    return ::posix_spawnp(pid, argv[0], &actions_, &attributes_, argv.data(), environ);
  }

 private:
  int ResetSignals() {
    sigset_t defaults;
    sigset_t noMask;
    ::sigemptyset(&defaults);
    ::sigaddset(&defaults, SIGPIPE);
    ::sigemptyset(&noMask);
    int error = ::posix_spawnattr_setsigdefault(&attributes_, &defaults);
    if (!error) error = ::posix_spawnattr_setsigmask(&attributes_, &noMask);
    if (!error) error = ::posix_spawnattr_setpgroup(&attributes_, 0);
    return error ? error
                 : ::posix_spawnattr_setflags(
                       &attributes_, POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETPGROUP);
  }

  int RedirectDescriptors(int outputFd) {
    int error = ::posix_spawn_file_actions_addopen(&actions_, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    for (int target : {STDOUT_FILENO, STDERR_FILENO}) {
      if (!error && outputFd >= 0) error = ::posix_spawn_file_actions_adddup2(&actions_, outputFd, target);
    }
    return error ? error : ::posix_spawn_file_actions_addclosefrom_np(&actions_, STDERR_FILENO + 1);
  }

  posix_spawnattr_t attributes_;
  posix_spawn_file_actions_t actions_;
  bool attributesReady_ = false;
  bool actionsReady_ = false;
};

void Tell(ChildOutput* sink, const char* text) {
  if (sink) sink->output(text);
}

void TellCannotStart(ChildOutput* sink, const std::string& program, int error) {
  const char* reason = ::strerrordesc_np(error);  // unlike strerror, safe beside other threads
  if (!reason) reason = "unknown error";
  int length = std::snprintf(nullptr, 0, Process::kCannotStart, program.c_str(), reason);
  if (length < 0) {
    Tell(sink, "cannot start a program\n");
    return;
  }
  std::string message(static_cast<std::size_t>(length), '\0');
  std::snprintf(message.data(), message.size() + 1, Process::kCannotStart, program.c_str(), reason);
  Tell(sink, message.c_str());
}

int StatusOf(int waitStatus) {
  if (WIFEXITED(waitStatus)) return WEXITSTATUS(waitStatus);
  if (WIFSIGNALED(waitStatus)) return Process::kSignalBase + WTERMSIG(waitStatus);
  return Process::kNotStarted;
}

int WaitForExit(pid_t pid) {
  int status = 0;
  while (::waitpid(pid, &status, 0) < 0) {
    if (errno != EINTR) return Process::kNotStarted;
  }
  return StatusOf(status);
}

// The child, its process group and the time it may take.
class ChildWatch {
 public:
  ChildWatch(pid_t pid, unsigned seconds)
      : pid_(pid),
        deadline_(seconds == 0 ? Clock::time_point::max() : Clock::now() + std::chrono::seconds(seconds)) {}

  // Milliseconds to wait for output before looking again; kills the group once time is up.
  int NextWait() {
    constexpr int kLookAgainMs = 100;
    ReapIfExited();
    if (Clock::now() >= deadline_ && !timedOut_) {
      timedOut_ = true;
      KillGroup();
    }
    return kLookAgainMs;
  }
  bool timedOut() const { return timedOut_; }
  // True a while after the group was killed: what still holds the output left the group and
  // is not waited for.
  bool GaveUp() const { return killedAt_ && Clock::now() - *killedAt_ > std::chrono::seconds(2); }

  // The child's status once the output is over; also ends what it left behind.
  int Finish() {
    KillGroup();
    if (!exited_) status_ = WaitForExit(pid_);
    return timedOut_ ? Process::kTimedOut : status_;
  }

 private:
  using Clock = std::chrono::steady_clock;

  // A child that exited while something it started keeps the output open: that leftover is
  // ended, as nothing will read its output.
  void ReapIfExited() {
    if (exited_) return;
    int waitStatus = 0;
    if (::waitpid(pid_, &waitStatus, WNOHANG) == pid_) {
      exited_ = true;
      status_ = StatusOf(waitStatus);
      KillGroup();
    }
  }
  void KillGroup() {
    ::kill(-pid_, SIGKILL);
    if (!killedAt_) killedAt_ = Clock::now();
  }

  pid_t pid_;
  Clock::time_point deadline_;
  bool exited_ = false;
  bool timedOut_ = false;
  int status_ = Process::kNotStarted;
  std::optional<Clock::time_point> killedAt_;
};

// Reads to the end of the child's output; stops forwarding once the sink declines more.
void Forward(int readFd, ChildOutput* sink, ChildWatch& watch) {
  constexpr std::size_t kChunk = 4096;
  char chunk[kChunk + 1];
  bool forwarding = sink != nullptr;
  for (;;) {
    pollfd ready{readFd, POLLIN, 0};
    int polled = ::poll(&ready, 1, watch.NextWait());
    if (watch.GaveUp()) return;
    if (polled < 0 && errno != EINTR) return;
    if (polled <= 0) continue;
    ssize_t count = ::read(readFd, chunk, kChunk);
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) return;
    if (!forwarding) continue;
    chunk[count] = '\0';
    forwarding = sink->output(chunk);
  }
}

int RunArguments(const std::vector<std::string>& arguments, bool captureOutput, unsigned seconds,
                 ChildOutput* sink) {
  if (arguments.empty() || arguments[0].empty()) {
    Tell(sink, Process::kEmptyCommand);
    return Process::kNotStarted;
  }
  OutputPipe output;
  if (captureOutput && !output.Open()) {
    TellCannotStart(sink, arguments[0], errno);
    return Process::kNotStarted;
  }
  SpawnSetup setup;
  pid_t pid = 0;
  int error = setup.Prepare(captureOutput ? output.writeEnd.get() : -1);
  if (!error) error = setup.Spawn(arguments, &pid);
  // Our copy of the write end must go, or the read below would never see the end of the output.
  output.writeEnd.Close();
  if (error) {
    TellCannotStart(sink, arguments[0], error);
    return Process::kNotStarted;
  }
  if (!captureOutput) return WaitForExit(pid);
  ChildWatch watch(pid, seconds);
  Forward(output.readEnd.get(), sink, watch);
  return watch.Finish();
}

int Run(const StringBase& commandLine, bool captureOutput, ChildOutput* sink) {
  std::vector<std::string> arguments;
  if (CommandLine::Split(commandLine.view(), &arguments) == 0) {
    Tell(sink, Process::kEmptyCommand);
    return Process::kNotStarted;
  }
  return RunArguments(arguments, captureOutput, 0, sink);
}

}  // namespace

int Process::RunNoWindow(const StringBase& commandLine, bool /*wait*/, bool captureOutput,
                         ChildOutput* sink) {
  std::unique_ptr<ChildOutput> owned(sink);
  int status = Run(commandLine, captureOutput, owned.get());
  if (owned) owned->done();
  return status;
}

int Process::RunCaptured(const std::vector<std::string>& arguments, unsigned seconds, ChildOutput* sink) {
  std::unique_ptr<ChildOutput> owned(sink);
  int status = RunArguments(arguments, true, seconds, owned.get());
  if (owned) owned->done();
  return status;
}

}  // namespace Port
