// Any input as a netlist database of a project.
#include <cstddef>
#include <cstdint>

#include "FuzzProject.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::ParseAsSource(data, size, ".pdb", "PLUGIN_PLX");
  return 0;
}
