// The part of a hierarchy that one look shows: the subtree of one node, a limited number of levels,
// instance nodes only. The result is a hierarchy like any other, so every writer prints it.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "DesignModel.h"

namespace quillon {

class TreeView {
 public:
  struct Settings {
    // The node whose subtree is shown, itself included; the root's children when unset.
    std::optional<std::size_t> top;
    // Levels shown below the first; deeper nodes are counted in their ancestor's moreBelow.
    std::optional<std::size_t> depth;
    // Leaves out every node that is no instance (entities, packages); their children move up.
    bool instancesOnly = false;

    bool ShowsAll() const { return !top && !depth && !instancesOnly; }
  };

  // The design-unit key of the node's unit, as "Architecture|cpu|rtl".
  static std::string_view UnitKeyOf(const TreeNodeInfo& node);

  // The first node, in pre-order, that stands for the design unit with design-unit key `key`
  // (Entity|cpu) of the file `file` (any file when empty). An entity stands for its first
  // architecture in the hierarchy, so that its instances are below it.
  static std::optional<std::size_t> FindUnit(const TreeInfo& tree, const std::string& key,
                                             const std::string& file);

  // The selected nodes under the unnamed root. A shared subtree whose first occurrence is left out
  // is given in full where the view meets it first, so every "shared" entry has its first
  // occurrence before it.
  static TreeInfo Select(const TreeInfo& tree, const Settings& settings);
};

}  // namespace quillon
