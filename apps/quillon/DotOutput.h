// Graphviz drawings: the hierarchy (tree) and the file dependency graph (order), left to right,
// each library a cluster, short labels with the full path as tooltip.
#pragma once

#include <ostream>

#include "DesignModel.h"

namespace quillon {

class DotOutput {
 public:
  // One box a design unit below the root, however often the hierarchy holds it, labelled with the
  // unit (and architecture); an edge from a unit to each unit below it, once. Instances are
  // boxes, other units (entities, packages) ellipses; library cells dashed, partitions with a
  // double border; a unit whose children a depth limit left out says how many.
  static void Tree(const TreeInfo& tree, std::ostream& out);
  // One box a file, numbered in compile order and labelled with its base name; an edge from a
  // file to a file it uses, red and bold when it lies on a cycle.
  static void Order(const FileGraphInfo& graph, std::ostream& out);
};

}  // namespace quillon
