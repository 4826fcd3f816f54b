// Graphviz drawings: the hierarchy (tree) and the file dependency graph (order).
#pragma once

#include <ostream>

#include "DesignModel.h"

namespace quillon {

class DotOutput {
 public:
  // One box a node below the root, labelled with instance label, unit, architecture and kind; library
  // cells dashed, partitions with a double border. A shared subtree is drawn once, with an edge
  // from each of its parents.
  static void Tree(const TreeInfo& tree, std::ostream& out);
  // One box a file, numbered in compile order; an edge from a file to a file it uses, red and bold
  // when it lies on a cycle.
  static void Order(const FileGraphInfo& graph, std::ostream& out);
};

}  // namespace quillon
