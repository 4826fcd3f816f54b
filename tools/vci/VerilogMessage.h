// One diagnostic of the Verilog compiler, kept as a value so that a cached result can repeat it.
#pragma once

#include <string>

namespace Hx_Vci {

enum class VerilogSeverity { kError, kWarning };

struct VerilogMessage {
  VerilogSeverity severity = VerilogSeverity::kError;
  std::string file;
  int line = 0;
  std::string text;  // without a final line break
};

}  // namespace Hx_Vci
