// Turns the modules found in a file into the objects that the VPI access offers: modules with
// their name, definition name and line; their ports, each with a low connection named like the
// port; and their module instances with definition name, instance name and line.
#pragma once

#include <vector>

#include "vci/Hx_VpiObject.h"
#include "vci/VerilogDesignInfo.h"

namespace Hx_Vci {

class VerilogDesignBuilder {
 public:
  // The design object, containing the modules in order.
  static Hx_VpiHandlePtr Build(const std::vector<VerilogModuleInfo>& modules);

 private:
  static Hx_VpiHandlePtr BuildModule(const VerilogModuleInfo& module);
  static Hx_VpiHandlePtr BuildPort(const std::string& name);
  static Hx_VpiHandlePtr BuildInstance(const VerilogInstanceInfo& instance);
};

}  // namespace Hx_Vci
