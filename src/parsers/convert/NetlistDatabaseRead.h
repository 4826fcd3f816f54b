// Small reading helpers over the netlist database shared by the parsers that read one.
#pragma once

#include <string>
#include <vector>

#include "Port/StringBase.h"
#include "xdm/Xdm_Block.h"
#include "xdm/Xdm_Design.h"
#include "xdm/Xdm_Exception.h"
#include "xdm/Xdm_Model.h"
#include "xdm/Xdm_PropertyHolder.h"

namespace Vad::NetlistDatabaseRead {

// The property's value, or empty when the object has no such property.
inline Port::StringBase PropertyText(const Xdm_PropertyHolder& object, const char* name) {
  const Xdm_Property* property = object.GetPropertyByName(name);
  return property ? Port::StringBase(property->GetValue()) : Port::StringBase();
}

// The model's first design; a database without one cannot be read and is reported like any
// other failure of the library.
inline Xdm_Design& FirstDesign(Xdm_Model& model) {
  Xdm_Design* design = model.GetDesignMgr()->GetDesignItr().Next();
  if (!design) throw Xdm_Exception::Base("the netlist database holds no design");
  return *design;
}

// The inner blocks that are not primitives (that hold blocks themselves), in stored order.
inline std::vector<const Xdm_Block*> HierarchicalChildren(const Xdm_Block& block) {
  std::vector<const Xdm_Block*> children;
  Xdm_BlockItr child = block.GetBlockItr();
  for (const Xdm_Block* inner = child.Next(); inner; inner = child.Next()) {
    if (inner->GetParent() && inner->GetNumBlocks() > 0) children.push_back(inner);
  }
  return children;
}

}  // namespace Vad::NetlistDatabaseRead
