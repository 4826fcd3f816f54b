#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <string>

#include "Port/ChildOutput.h"
#include "Port/File.h"
#include "Port/Process.h"
#include "Port/SafeCount.h"
#include "Port/StringBase.h"
#include "ScopedTempDir.h"
#include "ScopedWorkingDirectory.h"

namespace {

struct SinkLog {
  std::string text;
  int outputs = 0;
  int doneCalls = 0;
  int deletions = 0;
};

class CountingSink : public Port::ChildOutput {
 public:
  explicit CountingSink(SinkLog* log) : log_(log) { Port::NoteObjectCreated(); }
  ~CountingSink() override {
    ++log_->deletions;
    Port::NoteObjectDestroyed();
  }
  bool output(const char* text) override {
    EXPECT_EQ(log_->doneCalls, 0) << "output after done";
    ++log_->outputs;
    if (text) log_->text += text;
    return true;
  }
  void done() override { ++log_->doneCalls; }

 private:
  SinkLog* log_;
};

// A temporary directory holding the shell scripts that the tests run.
class ProcessTest : public testing::Test {
 protected:
  std::string Script(const std::string& name, const std::string& body) {
    std::string path = dir_.Path(name);
    std::unique_ptr<Port::Stream> stream = Port::File::open(path.c_str(), "w");
    EXPECT_TRUE(stream);
    if (!stream) return path;
    EXPECT_TRUE(stream->write("#!/bin/sh\n" + body + "\n"));
    EXPECT_TRUE(stream->close());
    EXPECT_EQ(::chmod(path.c_str(), 0755), 0);
    return path;
  }
  std::string ShowArgs() { return Script("show args", "for a in \"$@\"; do printf '[%s]\\n' \"$a\"; done"); }

  // Runs and checks that the sink was told done and deleted exactly once.
  int Run(const std::string& commandLine, SinkLog* log, bool captureOutput = true, bool wait = true) {
    int status =
        Port::Process::RunNoWindow(Port::StringBase(commandLine), wait, captureOutput, new CountingSink(log));
    EXPECT_EQ(log->doneCalls, 1);
    EXPECT_EQ(log->deletions, 1);
    return status;
  }

  static std::string Quoted(const std::string& text) { return "\"" + text + "\""; }

  ScopedTempDir dir_;
};

}  // namespace

TEST_F(ProcessTest, ProgramReceivesTheArgumentsAsQuoted) {
  SinkLog log;
  std::string command = Quoted(ShowArgs()) + " plain  \"two  words\" \"say \\\"hi\\\"\" \"\" back\\slash";
  EXPECT_EQ(Run(command, &log), 0);
  EXPECT_EQ(log.text, "[plain]\n[two  words]\n[say \"hi\"]\n[]\n[back\\slash]\n");
}

TEST_F(ProcessTest, ShellCharactersInArgumentsRunNoCommand) {
  std::string marker = dir_.Path("marker");
  SinkLog log;
  std::string command = Quoted(ShowArgs()) + " \"a;touch " + marker + "1\" \"$(touch " + marker +
                        "2)\" `touch" + " " + marker + "3` \"|\" \">\" " + marker + "4 ;touch " + marker +
                        "5";
  EXPECT_EQ(Run(command, &log), 0);
  EXPECT_EQ(log.text, "[a;touch " + marker + "1]\n[$(touch " + marker + "2)]\n[`touch]\n[" + marker +
                          "3`]\n[|]\n[>]\n[" + marker + "4]\n[;touch]\n[" + marker + "5]\n");
  for (const char* suffix : {"1", "2", "3", "4", "5"}) {
    EXPECT_FALSE(Port::File::exist((marker + suffix).c_str())) << suffix;
  }
}

TEST_F(ProcessTest, ProgramNameWithShellCharactersRunsOnlyThatProgram) {
  // A file name cannot hold '/', so the markers are relative: run from the test directory.
  ScopedWorkingDirectory inDir(dir_.path());
  std::string program =
      Script("conv;touch markerA;$(touch markerB)`touch markerC`|touch markerD", "echo ran");
  SinkLog log;
  EXPECT_EQ(Run(Quoted(program), &log), 0);
  EXPECT_EQ(log.text, "ran\n");
  for (const char* marker : {"markerA", "markerB", "markerC", "markerD"}) {
    EXPECT_FALSE(Port::File::exist(dir_.Path(marker).c_str())) << marker;
  }
}

TEST_F(ProcessTest, ExitStatusOrSignalBasePlusSignalIsReturned) {
  std::string program = Quoted(Script("status", "echo \"exiting $1\"; exit $1"));
  for (int expected : {0, 1, 3}) {
    SinkLog log;
    EXPECT_EQ(Run(program + " " + std::to_string(expected), &log), expected);
    EXPECT_EQ(log.text, "exiting " + std::to_string(expected) + "\n");
  }
  SinkLog log;
  EXPECT_EQ(Run(Quoted(Script("killed", "kill -TERM $$")), &log), Port::Process::kSignalBase + SIGTERM);
}

TEST_F(ProcessTest, MissingProgramIsReportedOnceInOneLine) {
  for (std::string missing : {dir_.Path("no-such-tool"), std::string("quillon-no-such-tool-on-path")}) {
    SinkLog log;
    EXPECT_EQ(Run(Quoted(missing) + " arg", &log), Port::Process::kNotStarted);
    std::string prefix = "cannot start \"" + missing + "\": ";
    EXPECT_EQ(log.text.substr(0, prefix.size()), prefix);
    EXPECT_EQ(std::count(log.text.begin(), log.text.end(), '\n'), 1);
    EXPECT_EQ(log.text.back(), '\n');
  }
  SinkLog notExecutable;
  std::string plainFile = dir_.Path("plain.txt");
  ASSERT_TRUE(Port::File::open(plainFile.c_str(), "w"));
  EXPECT_EQ(Run(Quoted(plainFile), &notExecutable), Port::Process::kNotStarted);
  EXPECT_EQ(std::count(notExecutable.text.begin(), notExecutable.text.end(), '\n'), 1);
}

TEST_F(ProcessTest, EmptyCommandLineRunsNothingAndUncapturedRunGivesTheSinkOnlyDone) {
  for (const char* empty : {"", "  \t "}) {
    SinkLog log;
    EXPECT_EQ(Run(empty, &log), Port::Process::kNotStarted);
    EXPECT_EQ(log.text, Port::Process::kEmptyCommand);
  }
  EXPECT_NE(Port::Process::RunNoWindow(Port::StringBase(""), true, true), 0);
  SinkLog log;
  EXPECT_EQ(Run(Quoted(Script("quiet", "exit 0")), &log, false), 0);
  EXPECT_EQ(log.outputs, 0);
  EXPECT_EQ(Port::Process::RunNoWindow(Port::StringBase(Quoted(Script("failing", "exit 1"))), true, true), 1);
}

TEST_F(ProcessTest, LargeMergedOutputIsGatheredCompletely) {
  constexpr int kBytes = 200 * 1024;
  std::string program = Script("chatty", "echo start >&2; head -c " + std::to_string(kBytes) +
                                             " /dev/zero | tr '\\000' x; echo; echo end >&2");
  SinkLog log;
  EXPECT_EQ(Run(Quoted(program), &log, true, false), 0);
  EXPECT_GT(log.outputs, 1);
  EXPECT_EQ(log.text, "start\n" + std::string(kBytes, 'x') + "\nend\n");
}

TEST_F(ProcessTest, ChildGetsNoInputAndNoInheritedDescriptors) {
  int ends[2];
  ASSERT_EQ(::pipe(ends), 0);  // deliberately without close-on-exec
  std::string program =
      Script("fds", "cat; for fd in " + std::to_string(ends[0]) + " " + std::to_string(ends[1]) +
                        "; do if [ -e /proc/$$/fd/$fd ]; then echo \"open $fd\"; fi; done; echo checked");
  SinkLog log;
  EXPECT_EQ(Run(Quoted(program), &log), 0);
  EXPECT_EQ(log.text, "checked\n");
  ::close(ends[0]);
  ::close(ends[1]);
}
