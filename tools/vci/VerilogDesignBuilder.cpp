#include "vci/VerilogDesignBuilder.h"

#include "vci/Hx_VpiConstants.h"

namespace Hx_Vci {

namespace {

constexpr int kDesign = 0;  // the type of the object that contains the top-level modules

}  // namespace

Hx_VpiHandlePtr VerilogDesignBuilder::Build(const std::vector<VerilogModuleInfo>& modules,
                                            const VerilogNameSet& primitives) {
  Hx_VpiHandlePtr design = Hx_VpiHandlePtr::Make(kDesign);
  for (const VerilogModuleInfo& module : modules) {
    design->AddChild(BuildModule(module, primitives));
  }
  return design;
}

Hx_VpiHandlePtr VerilogDesignBuilder::BuildModule(const VerilogModuleInfo& module,
                                                  const VerilogNameSet& primitives) {
  Hx_VpiHandlePtr object = Hx_VpiHandlePtr::Make(vpiModule);
  object->SetStr(vpiName, module.name);
  object->SetStr(vpiDefName, module.name);
  object->SetInt(vpiLineNo, module.line);
  for (const std::string& port : module.ports) {
    object->AddChild(BuildPort(port));
  }
  for (const VerilogInstanceInfo& instance : module.instances) {
    if (!primitives.contains(instance.defName)) object->AddChild(BuildInstance(instance));
  }
  return object;
}

Hx_VpiHandlePtr VerilogDesignBuilder::BuildPort(const std::string& name) {
  Hx_VpiHandlePtr port = Hx_VpiHandlePtr::Make(vpiPort);
  port->SetStr(vpiName, name);
  Hx_VpiHandlePtr lowConnection = Hx_VpiHandlePtr::Make(vpiNet);
  lowConnection->SetStr(vpiName, name);
  port->SetRelated(vpiLowConn, lowConnection);
  return port;
}

Hx_VpiHandlePtr VerilogDesignBuilder::BuildInstance(const VerilogInstanceInfo& instance) {
  Hx_VpiHandlePtr object = Hx_VpiHandlePtr::Make(vpiModule);
  object->SetStr(vpiName, instance.name);
  object->SetStr(vpiDefName, instance.defName);
  object->SetInt(vpiLineNo, instance.line);
  return object;
}

}  // namespace Hx_Vci
