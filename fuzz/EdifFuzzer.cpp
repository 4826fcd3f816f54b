// Any input as an EDIF netlist of a project, read for its hierarchy: parsed, elaborated and
// ordered.
#include <cstddef>
#include <cstdint>
#include <cstdlib>

#include "FuzzProject.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const int forced = ::setenv("CORVANE_ALWAYS_EDIF_HIER", "1", 1);
  (void)forced;
  fuzz::ParseAsSource(data, size, ".edf", "PLUGIN_Edif");
  return 0;
}
