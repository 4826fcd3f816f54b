// Reads the module's instance hierarchy into plain values.
#pragma once

#include "DesignModel.h"
#include "IHdlProject.h"

namespace Vad {
class IHdlNetListNode;
}

namespace quillon {

class TreeReader {
 public:
  // The hierarchy root and everything below it; the module's result when it has no root.
  static CitI::Result Read(Vad::IHdlProject* project, TreeNodeInfo& root);
  static TreeNodeInfo Describe(Vad::IHdlNetListNode* node);
};

}  // namespace quillon
