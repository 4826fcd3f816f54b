// Any input as a Vhdl source of a project: parsed, elaborated and ordered.
#include <cstddef>
#include <cstdint>

#include "FuzzProject.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::ParseAsSource(data, size, ".vhd", "PLUGIN_Vhdl");
  return 0;
}
