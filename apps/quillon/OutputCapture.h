// Keeps what a run writes to standard output and standard error (by any means: streams, stdio,
// child processes) in memory files, then hands it over and writes it where it was going. When both
// go to the same file they share one memory file, so that their interleaving is kept.
#pragma once

#include <string>

namespace quillon {

class OutputCapture {
 public:
  struct Captured {
    std::string out;
    std::string err;      // empty when shared
    bool shared = false;  // standard error went with standard output
  };

  // False, capturing nothing, when the descriptors cannot be redirected.
  bool Begin();
  // Restores the descriptors and returns what was written meanwhile.
  Captured End();
  ~OutputCapture();

  // Whether standard output and standard error are the same open file.
  static bool OutputsShared();
  // Writes a captured (or stored) output to the descriptors; false when standard output could
  // not take it.
  static bool Emit(const Captured& captured);

 private:
  static void FlushStreams();
  static std::string Drain(int descriptor);

  int savedOut_ = -1;
  int savedErr_ = -1;
  int memoryOut_ = -1;
  int memoryErr_ = -1;
};

}  // namespace quillon
