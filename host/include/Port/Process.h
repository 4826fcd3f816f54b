// Runs a tool as a child process, without a shell, and hands its output to a sink.
#pragma once

#include <string>
#include <vector>

#include "Port/ChildOutput.h"
#include "Port/StringBase.h"

namespace Port {

class Process {
 public:
  // Result when nothing could be run: empty command line, program not found or not startable.
  static constexpr int kNotStarted = 127;
  // Added to the signal number when the child was killed by a signal.
  static constexpr int kSignalBase = 128;

  // Messages handed to the sink when nothing could be run. kCannotStart takes the program name
  // and the reason.
  static constexpr const char* kEmptyCommand = "cannot run an empty command line\n";
  static constexpr const char* kCannotStart = "cannot start \"%s\": %s\n";

  // Splits `commandLine` into arguments (Port::CommandLine) and runs the first as the program,
  // searched on PATH unless it holds a '/'. No shell sees the text, so ';', '|', '>', '$(...)'
  // and backquotes reach the program as plain characters. The child gets /dev/null as input
  // and none of the caller's other descriptors.
  //
  // With `captureOutput`, the child's standard output and standard error, merged, are read to
  // the end and handed to `sink` in chunks (dropped when `sink` is null); otherwise the child
  // writes to the caller's own output. `sink` gets done() once at the end, whatever happened.
  //
  // Always waits for the child, even when `wait` is false, so that no child outlives the call
  // unreaped and the output is complete when the call returns.
  //
  // Takes ownership of `sink` and deletes it before returning, on every path.
  //
  // Returns the child's exit status (0 when the tool ran and succeeded), kSignalBase + the
  // signal number when a signal ended it, or kNotStarted, with a one-line message to the sink,
  // when nothing could be run.
  static int RunNoWindow(const StringBase& commandLine, bool wait, bool captureOutput,
                         ChildOutput* sink = nullptr);

  // Result when the time limit of RunCaptured ran out.
  static constexpr int kTimedOut = -1;

  // Runs `arguments` as they are (the first is the program), with output captured as
  // RunNoWindow does. The child leads a process group of its own; when `seconds` (0: no limit)
  // pass before its output ends, or when the child has exited while a process it left behind
  // still holds the output open, the whole group is killed. Takes ownership of `sink`. The
  // child's status as RunNoWindow gives it, or kTimedOut.
  static int RunCaptured(const std::vector<std::string>& arguments, unsigned seconds, ChildOutput* sink);
};

}  // namespace Port
