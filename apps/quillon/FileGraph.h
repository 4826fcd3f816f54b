// The file dependency graph behind a compile order, for drawing: a file uses the files of its
// tree node's children, as the module's own ordering counts it; edges that lie on a cycle are
// marked.
#pragma once

#include <vector>

#include "DesignModel.h"

namespace quillon {

class FileGraph {
 public:
  // The files of `order` in its order and the edges among them that the hierarchy below `root`
  // gives, one per pair of files. Nodes without a file contribute nothing below them; the root
  // itself stands for its children.
  static FileGraphInfo Build(const TreeInfo& tree, const std::vector<OrderEntry>& order);
};

}  // namespace quillon
