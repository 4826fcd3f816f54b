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
  // The hierarchy root and everything below it; the module's result when it has no root. The
  // path texts, which grow with the depth, are read only `withPaths`.
  static CitI::Result Read(Vad::IHdlProject* project, TreeInfo& tree, bool withPaths);
  // One node without its children.
  static TreeNodeInfo Describe(Vad::IHdlNetListNode* node, bool withPaths);
  // The tree below `root`, without recursing.
  static TreeInfo ReadTree(Vad::IHdlNetListNode* root, bool withPaths);
};

}  // namespace quillon
