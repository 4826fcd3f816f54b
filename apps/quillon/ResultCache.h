// The answers of whole runs, kept in the cache directory beside the parse cache. An entry is
// keyed by everything that shapes a run's answer apart from the files it reads: the program and
// its module, the arguments, the current directory, the environment and which outputs are
// terminals. It holds the stamps of every file and directory the run read (project files and
// lists, the directories given as sources, sources, -v files, -y directories), the exit status
// and the bytes written to standard output and error. An entry is trusted when its key matches
// and every stamp holds (InputStamp); the stored bytes are then the answer, found without reading
// the project at all.
//
// Runs whose answer depends on files the stamps cannot see are not kept: sources of plug-ins
// other than VHDL and Verilog (converters, other programs), Verilog that uses `include, and
// patterns matched against the file system.
#pragma once

#include <optional>
#include <string>

#include "Options.h"
#include "OutputCapture.h"
#include "ProjectSources.h"

namespace quillon {

class ResultCache {
 public:
  ResultCache(std::string directory, const Options& options);

  // Whether a run of these options can be kept: a command that only writes its answer, to
  // standard output, and sources that are not read from standard input.
  static bool Applies(const Options& options);

  struct Answer {
    int status;
    OutputCapture::Captured output;
  };
  // The stored answer, when the entry is trusted.
  std::optional<Answer> Lookup() const;
  // Keeps the answer of a run that started at `runStart` on `resolved` (the sources as gathered,
  // after the library search). Silent when it cannot: the next run just works again.
  void Store(const ProjectSources& resolved, std::int64_t runStart, int status,
             const OutputCapture::Captured& output) const;

 private:
  static std::string KeyOf(const Options& options);
  std::string EntryPath() const;

  std::string directory_;
  std::string key_;
};

}  // namespace quillon
