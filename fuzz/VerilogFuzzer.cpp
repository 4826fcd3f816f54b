// Any input as a Verilog source of a project: parsed, elaborated and ordered.
#include <cstddef>
#include <cstdint>

#include "FuzzProject.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::ParseAsSource(data, size, ".v", "PLUGIN_Verilog");
  return 0;
}
