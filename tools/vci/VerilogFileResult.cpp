#include "vci/VerilogFileResult.h"

namespace Hx_Vci {

std::size_t VerilogFileResult::ApproximateBytes() const {
  std::size_t bytes = sizeof(*this);
  for (const VerilogModuleInfo& module : modules) {
    bytes += sizeof(module) + module.name.size();
    for (const std::string& port : module.ports) bytes += sizeof(port) + port.size();
    for (const VerilogInstanceInfo& instance : module.instances) {
      bytes += sizeof(instance) + instance.defName.size() + instance.name.size();
    }
  }
  for (const std::string& primitive : primitives) bytes += sizeof(primitive) + primitive.size();
  for (const VerilogMessage& message : messages)
    bytes += sizeof(message) + message.file.size() + message.text.size();
  for (const VerilogDependency& dependency : dependencies)
    bytes += sizeof(dependency) + dependency.path.size();
  return bytes;
}

}  // namespace Hx_Vci
