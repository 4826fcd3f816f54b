#include "DotOutput.h"

#include <map>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "TreeView.h"

namespace quillon {

namespace {

// A DOT string: every label, tooltip and name goes through here, whatever it holds.
std::string Quoted(std::string_view text) {
  std::string quoted = "\"";
  for (char c : text) {
    if (c == '"' || c == '\\') quoted += '\\';
    if (c == '\n') {
      quoted += "\\n";
      continue;
    }
    if (c == '\r') continue;
    quoted += c;
  }
  return quoted + '"';
}

struct DotNode {
  std::string id;
  std::string library;  // empty: outside every cluster
  std::string attributes;
};

void WriteHeader(std::string_view name, std::ostream& out) {
  // Left to right with ranks shared across the clusters and little room between the nodes of a
  // rank: a wide hierarchy stays a page, not a strip.
  out << "digraph " << name
      << " {\n  rankdir=LR;\n  newrank=true;\n  nodesep=0.15;\n  node [shape=box, fontsize=10];\n";
}

// The nodes of each library in a cluster of their own, libraries in the order they first appear.
void WriteNodes(const std::vector<DotNode>& nodes, std::ostream& out) {
  std::vector<std::string> libraries;
  std::map<std::string, std::vector<const DotNode*>> members;
  for (const DotNode& node : nodes) {
    auto [entry, added] = members.try_emplace(node.library);
    if (added) libraries.push_back(node.library);
    entry->second.push_back(&node);
  }
  for (const std::string& library : libraries) {
    std::string_view indent = library.empty() ? "  " : "    ";
    if (!library.empty()) {
      out << "  subgraph " << Quoted("cluster_" + library) << " {\n    label=" << Quoted(library) << ";\n";
    }
    for (const DotNode* node : members[library])
      out << indent << node->id << " [" << node->attributes << "];\n";
    if (!library.empty()) out << "  }\n";
  }
}

std::string UnitLabel(const TreeNodeInfo& node) {
  std::string label = node.unit.empty() ? node.name : node.unit;
  if (!node.architecture.empty()) label += "(" + node.architecture + ")";
  // An entity and its package bodies and declarations share their names.
  if (node.type != "instance" && node.elementType) label += "\n" + *node.elementType;
  if (node.moreBelow > 0) label += "\n(" + std::to_string(node.moreBelow) + " more below)";
  return label;
}

std::string UnitAttributes(const TreeNodeInfo& node) {
  std::string attributes =
      "label=" + Quoted(UnitLabel(node)) + ", tooltip=" + Quoted(node.file.value_or(node.name));
  if (node.type != "instance") attributes += ", shape=ellipse";
  if (node.libraryCell) attributes += ", style=dashed";
  if (!node.libraryCell && !node.elementType) attributes += ", style=dotted";
  if (!node.partition.empty()) attributes += ", peripheries=2";
  return attributes;
}

// One DOT node per design unit: the same unit of the same file, whatever instance holds it.
class UnitNodes {
 public:
  std::size_t Of(const TreeNodeInfo& node) {
    std::string identity = node.file.value_or("") + '\n' + std::string(TreeView::UnitKeyOf(node));
    auto [entry, added] = numbers_.try_emplace(std::move(identity), nodes_.size());
    if (added) {
      std::string id = "n" + std::to_string(entry->second);
      nodes_.push_back({std::move(id), node.library.value_or(""), UnitAttributes(node)});
    }
    return entry->second;
  }
  const std::vector<DotNode>& nodes() const { return nodes_; }

 private:
  std::map<std::string, std::size_t> numbers_;
  std::vector<DotNode> nodes_;
};

}  // namespace

void DotOutput::Tree(const TreeInfo& tree, std::ostream& out) {
  UnitNodes units;
  std::vector<std::size_t> unitOf(tree.nodes.size());
  std::set<std::pair<std::size_t, std::size_t>> seen;
  std::vector<std::pair<std::size_t, std::size_t>> edges;
  // The flat list has every parent before its children, and a shared entry after its first
  // occurrence.
  for (std::size_t i = 1; i < tree.nodes.size(); ++i) {
    const TreeNodeInfo& node = tree.nodes[i];
    unitOf[i] = node.sharedWith ? unitOf[*node.sharedWith] : units.Of(node);
    if (node.parent == 0) continue;
    std::pair<std::size_t, std::size_t> edge{unitOf[node.parent], unitOf[i]};
    if (seen.insert(edge).second) edges.push_back(edge);
  }
  WriteHeader("hierarchy", out);
  WriteNodes(units.nodes(), out);
  for (const auto& [from, to] : edges) out << "  n" << from << " -> n" << to << ";\n";
  out << "}\n";
}

void DotOutput::Order(const FileGraphInfo& graph, std::ostream& out) {
  std::vector<DotNode> files;
  for (std::size_t i = 0; i < graph.files.size(); ++i) {
    const OrderEntry& file = graph.files[i];
    std::string label = std::to_string(i + 1) + ". " + std::string(BaseNameOf(file.path));
    files.push_back(
        {"f" + std::to_string(i), file.library, "label=" + Quoted(label) + ", tooltip=" + Quoted(file.path)});
  }
  WriteHeader("compile_order", out);
  WriteNodes(files, out);
  for (const FileEdge& edge : graph.edges) {
    out << "  f" << edge.from << " -> f" << edge.to;
    if (edge.onCycle) out << " [color=red, style=bold]";
    out << ";\n";
  }
  out << "}\n";
}

}  // namespace quillon
