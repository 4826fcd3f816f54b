// What the compiler keeps of a Verilog file: its modules with their ports and module instances.
// Plain values, so that results can be cached and shared without any reference counting.
#pragma once

#include <functional>
#include <set>
#include <string>
#include <vector>

namespace Hx_Vci {

struct VerilogInstanceInfo {
  std::string defName;  // the instantiated module's name
  std::string name;     // the instance name; an instance array keeps its base name
  int line = 0;         // line of the instance name
};

// Names looked up by text, such as those of the user-defined primitives known to a compile.
using VerilogNameSet = std::set<std::string, std::less<>>;

struct VerilogModuleInfo {
  std::string name;
  int line = 0;  // line of the `module` keyword in its file
  // One name per port in order; empty for an unnamed port (a concatenation or an empty entry).
  std::vector<std::string> ports;
  std::vector<VerilogInstanceInfo> instances;
};

}  // namespace Hx_Vci
