// Any input as a project file and as a file list of the command line.
#include <cstddef>
#include <cstdint>
#include <string>

#include "FuzzProject.h"
#include "ProjectLoader.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  for (auto kind : {quillon::SourceArgument::Kind::kProjectFile, quillon::SourceArgument::Kind::kFileList}) {
    quillon::Options options;
    options.sources.push_back({kind, fuzz::WriteInput(data, size, ".txt"), "", ""});
    quillon::ProjectSources sources;
    std::string error;
    quillon::ProjectLoader(sources).Load(options, error);
  }
  return 0;
}
