// The text output of the commands, for people.
#pragma once

#include <ostream>
#include <vector>

#include "DesignModel.h"

namespace quillon {

class TextOutput {
 public:
  // One line a unit, in line order: FILE:LINE: TYPE KEY (library LIB). Records whose design-unit key is their
  // type name alone (libraries, uses, instances) show their name instead.
  static void Units(const std::vector<FileInfo>& files, std::ostream& out);
  static void Units(const FileInfo& file, std::ostream& out);
  // The root's children and their subtrees, two blanks of indent a level: instance label, unit,
  // architecture, kind, file and the flags (library cell, not in the project, partition). A
  // shared subtree is printed in full once; later occurrences are one line ending in "(shared,
  // see above)". Below kDeepestIndent levels the indent stops growing and the line starts with
  // its level instead. Files show by their base names unless `fullPaths`. A node whose children a
  // depth limit left out is followed by a line "... (N more below)".
  static void Tree(const TreeInfo& tree, bool fullPaths, std::ostream& out);
  static constexpr std::size_t kDeepestIndent = 100;
  // One path a line; with the library and a blank before it when asked.
  static void Order(const std::vector<OrderEntry>& order, bool withLibrary, std::ostream& out);
  // One line a port: POSITION NAME DIRECTION TYPE, then HIGH..LOW when the port has a range.
  static void Ports(const std::vector<PortInfo>& ports, std::ostream& out);
  // "N files, M design units: E errors, W warnings"
  static void CheckSummary(std::size_t files, std::size_t units, int errors, int warnings, std::ostream& out);

 private:
  static void Node(const TreeNodeInfo& node, std::size_t depth, bool fullPaths, std::ostream& out);
  static void Indent(std::size_t depth, std::ostream& out);
};

}  // namespace quillon
