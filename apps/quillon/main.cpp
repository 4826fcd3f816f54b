// quillon: the command-line host of the Quillon module.
#include <cstdio>
#include <string>

#include "ModuleLoader.h"
#include "RavA/Factory.h"

namespace {

constexpr const char* kUsage =
    "usage: quillon COMMAND\n"
    "commands:\n"
    "  factories   list the classes the module registers\n";

int ListFactories() {
  quillon::ModuleLoader module;
  std::string error;
  if (!module.Load(error)) {
    std::fprintf(stderr, "quillon: %s\n", error.c_str());
    return 1;
  }
  std::printf("module %s registers %zu classes:\n", module.path().c_str(),
              RavA::Factory::RegisteredClasses().size());
  for (const Port::XUID& id : RavA::Factory::RegisteredClasses()) std::printf("  %s\n", id.ToString().c_str());
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  std::string command = argc > 1 ? argv[1] : "";
  if (command == "factories") return ListFactories();
  if (command == "-h" || command == "--help") {
    std::fputs(kUsage, stdout);
    return 0;
  }
  std::fprintf(stderr, "quillon: %s\n%s", command.empty() ? "no command given" : ("unknown command '" + command + "'").c_str(), kUsage);
  return 2;
}
