// quillon: the command-line host of the Quillon module.
#include <cstdio>
#include <exception>
#include <string>

#include "CommandRunner.h"
#include "ExitStatus.h"
#include "InstallLayout.h"
#include "Options.h"

namespace {

int ShowVersion() {
  std::printf("quillon %s\nmodule %s\n", QUILLON_VERSION, quillon::InstallLayout::ModulePath().c_str());
  return quillon::kExitDone;
}

}  // namespace

int main(int argc, char** argv) {
  quillon::Options options;
  std::string error;
  try {
    switch (quillon::Options::Parse(argc, argv, options, error)) {
      case quillon::Options::Outcome::kHelpShown:
        return quillon::kExitDone;
      case quillon::Options::Outcome::kVersionAsked:
        return ShowVersion();
      case quillon::Options::Outcome::kUsageError:
        std::fprintf(stderr, "quillon: %s (see quillon --help)\n", error.c_str());
        return quillon::kExitBadInput;
      case quillon::Options::Outcome::kRun:
        break;
    }
    options.arguments.assign(argv + 1, argv + argc);
    return quillon::CommandRunner(options).Run();
  } catch (const std::exception& failure) {
    // Nothing is expected to throw; should the standard library run out of memory, say so in one
    // line rather than abort with a trace.
    std::fprintf(stderr, "quillon: %s\n", failure.what());
    return quillon::kExitFailed;
  }
}
