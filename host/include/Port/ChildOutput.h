// Where the output of a child process goes. Port::Process::RunNoWindow takes ownership of a sink
// created on the heap and deletes it when the run is over.
#pragma once

namespace Port {

class ChildOutput {
 public:
  // Called with the child's output as it arrives, in null-terminated chunks (which may split a
  // line); `text` may be null. Returning false asks for no further output: the rest is drained
  // and dropped.
  virtual bool output(const char* text) = 0;
  // Called once after the last output, when the run is over (also when the child could not be
  // started).
  virtual void done() = 0;
  virtual ~ChildOutput();
};

}  // namespace Port
