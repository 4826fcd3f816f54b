#include "DotOutput.h"

#include <string>
#include <string_view>

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

class TreeDrawing {
 public:
  explicit TreeDrawing(std::ostream& out) : out_(out) {}

  // Draws the node and its subtree; returns the node's id.
  std::string Draw(const TreeNodeInfo& node) {
    std::string id = "n" + std::to_string(next_++);
    out_ << "  " << id << " [label=" << Quoted(NodeLabel(node));
    if (node.libraryCell) out_ << ", style=dashed";
    if (!node.partition.empty()) out_ << ", peripheries=2";
    out_ << "];\n";
    for (const TreeNodeInfo& child : node.children) {
      std::string childId = Draw(child);
      out_ << "  " << id << " -> " << childId << ";\n";
    }
    return id;
  }

 private:
  std::ostream& out_;
  std::size_t next_ = 0;
};

}  // namespace

void DotOutput::Tree(const TreeNodeInfo& root, std::ostream& out) {
  out << "digraph hierarchy {\n  node [shape=box];\n";
  TreeDrawing drawing(out);
  for (const TreeNodeInfo& top : root.children) drawing.Draw(top);
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
