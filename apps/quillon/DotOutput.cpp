#include "DotOutput.h"

#include <string>
#include <string_view>
#include <vector>

namespace quillon {

namespace {

std::string Quoted(std::string_view text) {
  std::string quoted = "\"";
  for (char c : text) {
    if (c == '"' || c == '\\') quoted += '\\';
    if (c == '\n') {
      quoted += "\\n";
      continue;
    }
    quoted += c;
  }
  return quoted + '"';
}

std::string NodeLabel(const TreeNodeInfo& node) {
  std::string label;
  if (!node.instance.empty()) label += node.instance + "\n";
  label += node.unit.empty() ? node.name : node.unit;
  if (!node.architecture.empty()) label += "(" + node.architecture + ")";
  if (!node.kind.empty()) label += "\n" + node.kind;
  if (!node.partition.empty()) label += "\npartition " + node.partition;
  return label;
}

void DrawNode(const TreeNodeInfo& node, const std::string& id, std::ostream& out) {
  out << "  " << id << " [label=" << Quoted(NodeLabel(node));
  if (node.libraryCell) out << ", style=dashed";
  if (!node.partition.empty()) out << ", peripheries=2";
  out << "];\n";
}

}  // namespace

void DotOutput::Tree(const TreeInfo& tree, std::ostream& out) {
  out << "digraph hierarchy {\n  node [shape=box];\n";
  // Boxes numbered in pre-order; the edge to a child follows the child's subtree.
  std::vector<std::string> ids(tree.nodes.size());
  std::size_t next = 0;
  auto idOf = [&](std::size_t index) -> const std::string& {
    if (ids[index].empty()) ids[index] = "n" + std::to_string(next++);
    return ids[index];
  };
  struct Open {
    std::size_t index;
    std::size_t nextChild;
  };
  std::vector<Open> open;
  auto enter = [&](std::size_t index) {
    DrawNode(tree.nodes[index], idOf(index), out);
    open.push_back({index, 0});
  };
  if (!tree.nodes.empty()) open.push_back({0, 0});
  while (!open.empty()) {
    Open& top = open.back();
    const TreeNodeInfo& node = tree.nodes[top.index];
    if (top.nextChild == node.children.size()) {
      if (top.index != 0 && node.parent != 0)
        out << "  " << ids[node.parent] << " -> " << ids[top.index] << ";\n";
      open.pop_back();
      continue;
    }
    std::size_t child = node.children[top.nextChild++];
    const TreeNodeInfo& childNode = tree.nodes[child];
    if (!childNode.sharedWith) {
      enter(child);
    } else if (top.index != 0) {
      out << "  " << ids[top.index] << " -> " << idOf(*childNode.sharedWith) << ";\n";
    }
  }
  out << "}\n";
}

void DotOutput::Order(const FileGraphInfo& graph, std::ostream& out) {
  out << "digraph compile_order {\n  node [shape=box];\n";
  for (std::size_t i = 0; i < graph.files.size(); ++i) {
    out << "  f" << i << " [label=" << Quoted(std::to_string(i + 1) + ". " + graph.files[i]) << "];\n";
  }
  for (const FileEdge& edge : graph.edges) {
    out << "  f" << edge.from << " -> f" << edge.to;
    if (edge.onCycle) out << " [color=red, style=bold]";
    out << ";\n";
  }
  out << "}\n";
}

}  // namespace quillon
