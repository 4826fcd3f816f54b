#include "FileGraph.h"

#include <boost/graph/adjacency_list.hpp>
#include <boost/graph/strong_components.hpp>
#include <map>
#include <set>
#include <utility>

namespace quillon {

namespace {

using FileIndex = std::map<std::string, std::size_t>;
using EdgeSet = std::set<std::pair<std::size_t, std::size_t>>;

// Instances between Verilog files are no dependency: those files keep the order they were given.
using VerilogFiles = std::vector<bool>;

// The edges from each node's file to its children's files, walked from `start` without
// recursing; a shared subtree once, and nothing below a node without a file.
void CollectEdges(const TreeInfo& tree, std::size_t start, const FileIndex& files,
                  const VerilogFiles& verilog, EdgeSet& edges, std::vector<bool>& walked) {
  auto resolved = [&](std::size_t index) { return tree.nodes[index].sharedWith.value_or(index); };
  std::vector<std::size_t> pending{start};
  while (!pending.empty()) {
    std::size_t index = resolved(pending.back());
    pending.pop_back();
    if (walked[index]) continue;
    walked[index] = true;
    const TreeNodeInfo& node = tree.nodes[index];
    if (!node.file) continue;
    auto from = files.find(*node.file);
    for (std::size_t child : node.children) {
      const TreeNodeInfo& childNode = tree.nodes[resolved(child)];
      if (!childNode.file || from == files.end()) continue;
      auto to = files.find(*childNode.file);
      if (to == files.end() || to->second == from->second) continue;
      if (verilog[from->second] && verilog[to->second]) continue;
      edges.insert({from->second, to->second});
    }
    pending.insert(pending.end(), node.children.rbegin(), node.children.rend());
  }
}

std::vector<int> ComponentOfEachFile(std::size_t fileCount, const EdgeSet& edges) {
  boost::adjacency_list<boost::vecS, boost::vecS, boost::directedS> graph(fileCount);
  for (const auto& [from, to] : edges) boost::add_edge(from, to, graph);
  std::vector<int> component(fileCount);
  boost::strong_components(graph, component.data());
  return component;
}

}  // namespace

FileGraphInfo FileGraph::Build(const TreeInfo& tree, const std::vector<OrderEntry>& order) {
  FileGraphInfo graph;
  FileIndex index;
  VerilogFiles verilog;
  for (const OrderEntry& entry : order) {
    if (!index.emplace(entry.path, graph.files.size()).second) continue;
    graph.files.push_back(entry);
    verilog.push_back(entry.plugin == "PLUGIN_Verilog");
  }
  EdgeSet edges;
  std::vector<bool> walked(tree.nodes.size(), false);
  if (!tree.nodes.empty() && tree.Root().file) {
    CollectEdges(tree, 0, index, verilog, edges, walked);
  } else if (!tree.nodes.empty()) {
    for (std::size_t top : tree.Root().children) CollectEdges(tree, top, index, verilog, edges, walked);
  }
  std::vector<int> component = ComponentOfEachFile(graph.files.size(), edges);
  for (const auto& [from, to] : edges) graph.edges.push_back({from, to, component[from] == component[to]});
  return graph;
}

}  // namespace quillon
