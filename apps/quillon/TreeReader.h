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
  // The same tree with only what the file graph and the diagnostics look at: the links between
  // the nodes, the library-cell flag and unit, and the element's type, key and file. The labels
  // that the tree's printers show stay empty.
  static CitI::Result ReadLinks(Vad::IHdlProject* project, TreeInfo& tree);

  enum class Detail { kLinks, kLabels, kLabelsAndPaths };
  // The tree below `root`, without recursing.
  static TreeInfo ReadTree(Vad::IHdlNetListNode* root, Detail detail);

 private:
  static CitI::Result ReadRoot(Vad::IHdlProject* project, TreeInfo& tree, Detail detail);
};

}  // namespace quillon
