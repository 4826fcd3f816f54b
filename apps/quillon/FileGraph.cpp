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

void CollectEdges(const TreeNodeInfo& node, const FileIndex& files, const VerilogFiles& verilog,
                  EdgeSet& edges) {
  if (!node.file) return;
  auto from = files.find(*node.file);
  for (const TreeNodeInfo& child : node.children) {
    if (!child.file || from == files.end()) continue;
    auto to = files.find(*child.file);
    if (to == files.end() || to->second == from->second) continue;
    if (verilog[from->second] && verilog[to->second]) continue;
    edges.insert({from->second, to->second});
  }
  for (const TreeNodeInfo& child : node.children) CollectEdges(child, files, verilog, edges);
}

std::vector<int> ComponentOfEachFile(std::size_t fileCount, const EdgeSet& edges) {
  boost::adjacency_list<boost::vecS, boost::vecS, boost::directedS> graph(fileCount);
  for (const auto& [from, to] : edges) boost::add_edge(from, to, graph);
  std::vector<int> component(fileCount);
  boost::strong_components(graph, component.data());
  return component;
}

}  // namespace

FileGraphInfo FileGraph::Build(const TreeNodeInfo& root, const std::vector<OrderEntry>& order) {
  FileGraphInfo graph;
  FileIndex index;
  VerilogFiles verilog;
  for (const OrderEntry& entry : order) {
    if (!index.emplace(entry.path, graph.files.size()).second) continue;
    graph.files.push_back(entry.path);
    verilog.push_back(entry.plugin == "PLUGIN_Verilog");
  }
  EdgeSet edges;
  if (root.file) {
    CollectEdges(root, index, verilog, edges);
  } else {
    for (const TreeNodeInfo& top : root.children) CollectEdges(top, index, verilog, edges);
  }
  std::vector<int> component = ComponentOfEachFile(graph.files.size(), edges);
  for (const auto& [from, to] : edges) graph.edges.push_back({from, to, component[from] == component[to]});
  return graph;
}

}  // namespace quillon
