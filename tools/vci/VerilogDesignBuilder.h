// Turns the modules found in a file into the objects that the VPI access offers: modules with
// their name, definition name and line; their ports, each with a low connection named like the
// port; and their module instances with definition name, instance name and line. An instance of
// a user-defined primitive looks like a module instance but is none.
#pragma once

#include <vector>

#include "vci/Hx_VpiObject.h"
#include "vci/VerilogDesignInfo.h"

namespace Hx_Vci {

class VerilogDesignBuilder {
 public:
  // The design object, containing the modules in order; instances of `primitives` are left out.
  static Hx_VpiHandlePtr Build(const std::vector<VerilogModuleInfo>& modules,
                               const VerilogNameSet& primitives);

 private:
  static Hx_VpiHandlePtr BuildModule(const VerilogModuleInfo& module, const VerilogNameSet& primitives);
  static Hx_VpiHandlePtr BuildPort(const std::string& name);
  static Hx_VpiHandlePtr BuildInstance(const VerilogInstanceInfo& instance);
};

}  // namespace Hx_Vci
