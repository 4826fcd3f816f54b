#include "CCompileOrder.h"

#include <algorithm>
#include <boost/graph/depth_first_search.hpp>
#include <boost/graph/dijkstra_shortest_paths.hpp>
#include <boost/graph/topological_sort.hpp>
#include <iterator>
#include <limits>
#include <memory>
#include <utility>

#include "Arch.h"
#include "ArchitectureChoice.h"
#include "CHdlElement.h"
#include "CUnitTree.h"
#include "DbObject.h"
#include "NetListWalk.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "Prjrep/TSequenceSetHelper.h"

namespace Vad {
namespace {

constexpr const char* kRevision = "1.1";
constexpr std::uint32_t kDeclarationUnits = DbType::kEntity | DbType::kPackageDecl;
constexpr std::int32_t kUnreached = std::numeric_limits<std::int32_t>::max();
constexpr const char* kVerilogPlugin = "PLUGIN_Verilog";

std::unique_ptr<Port_MsgManData> Message(int line) {
  return Port_MsgManData::createObject(CompileOrderText::kCategory, CompileOrderText::kSource, line,
                                       kRevision);
}

bool IsDeclarationUnit(IHdlElement* element) {
  auto* unit = Prjrep::ImplementationCast<DbObject>(element);
  return unit && (unit->GetType() & kDeclarationUnits);
}

// The root that elaboration makes: no element, no parent, no name.
bool IsUnnamedRoot(IHdlNetListNode* node) {
  if (node->GetElement()) return false;
  Prjrep::AutoRelease<IHdlNetListNodeIterator> parent;
  if (node->GetParents(parent.Out()) != CitI::kOk || !parent || !parent->IsDone()) return false;
  auto* internal = Prjrep::QueryAs<IHdlNetListNodeInternal>(node);
  Port::StringBase name;
  return internal && internal->GetName(&name) == CitI::kOk && name.IsEmpty();
}

class BackEdgeRecorder : public boost::default_dfs_visitor {
 public:
  BackEdgeRecorder(std::vector<CCompileOrder::BackEdge>& backEdges, bool& cycleFound)
      : backEdges_(&backEdges), cycleFound_(&cycleFound) {}

  template <class Edge, class Graph>
  void back_edge(Edge edge, const Graph& graph) {
    *cycleFound_ = true;
    backEdges_->emplace_back(boost::source(edge, graph), boost::target(edge, graph));
  }

 private:
  std::vector<CCompileOrder::BackEdge>* backEdges_;
  bool* cycleFound_;
};

}  // namespace

Port::StringBase CCompileOrder::DisplayNameOf(IHdlFile* file) {
  Port::StringBase directory;
  Port::StringBase fileName;
  if (!file || file->getFileName(&directory, &fileName) != CitI::kOk) {
    return Port::StringBase(CompileOrderText::kUnnamedFile);
  }
  directory.Append(fileName.view());
  return directory;
}

CitI::Result CCompileOrder::OrderBelow(CElaborator& elaborator, CLibRefs* libraryReferences,
                                       IHdlNetListNode* start, IHdlNetListNode* top,
                                       IHdlParserConfig* parserConfig, bool byUnit, IHdlFileIterator** out) {
  if (!start || !out) return CitI::kInvalidArg;
  CCompileOrder order;
  if (!top || NetListWalk::Identity(top) == NetListWalk::Identity(start)) {
    return order.ComputeCompileOrder(start, out);
  }
  if (!byUnit) return order.ComputeCompileOrder(top, out);
  Prjrep::AutoPtr<IHdlNetListNode> tree;
  CitI::Result status =
      CUnitTree(elaborator).BuildUnitTree(libraryReferences, start, top, parserConfig, tree);
  if (status != CitI::kOk) return status;
  return order.ComputeCompileOrder(tree.Get(), out);
}

CitI::Result CCompileOrder::ComputeCompileOrder(IHdlNetListNode* node, IHdlFileIterator** out) {
  if (!node || !out) return CitI::kInvalidArg;
  *out = nullptr;
  ClearGraph();
  orderArchitectures_ = true;
  CitI::Result status = BuildFileGraph(node, false);
  if (status == CitI::kOk && architectureEdges_ > 0 && FindBackEdges()) {
    orderArchitectures_ = false;
    ClearGraph();
    status = BuildFileGraph(node, false);
  }
  if (status == CitI::kOk && FindBackEdges()) status = RelaxAfterStrictCycles(node);
  return status == CitI::kOk ? EmitOrder(out) : status;
}

CitI::Result CCompileOrder::RelaxAfterStrictCycles(IHdlNetListNode* node) {
  Message(__LINE__)->issueWarning("%s", CompileOrderText::kStrictCycle);
  CitI::Result status = ReportCycles(true);
  if (status != CitI::kOk) return status;
  Message(__LINE__)->issueWarning("%s", CompileOrderText::kRelaxing);
  ClearGraph();
  status = BuildFileGraph(node, true);
  if (status != CitI::kOk) return status;
  if (FindBackEdges()) return CutRelaxedCycles();
  Message(__LINE__)->issueWarning("%s", CompileOrderText::kRelaxedOrderValid);
  return CitI::kOk;
}

CitI::Result CCompileOrder::CutRelaxedCycles() {
  Message(__LINE__)->issueWarning("%s", CompileOrderText::kRelaxedCycle);
  CitI::Result status = ReportCycles(true);
  if (status != CitI::kOk) return status;
  Message(__LINE__)->issueWarning("%s", CompileOrderText::kBreaking);
  BreakCycles();
  if (FindBackEdges()) {
    Message(__LINE__)->issueError("%s", CompileOrderText::kUnbreakable);
    return CitI::kFail;
  }
  Message(__LINE__)->issueWarning("%s", CompileOrderText::kNoValidOrder);
  return CitI::kOk;
}

void CCompileOrder::ClearGraph() {
  graph_.clear();
  vertices_.clear();
  architectures_.clear();
  architectureEdges_ = 0;
  backEdges_.clear();
  cycleFound_ = false;
}

CitI::Result CCompileOrder::BuildFileGraph(IHdlNetListNode* node, bool relaxed) {
  if (!node) return CitI::kInvalidArg;
  CitI::Result status = CitI::kOk;
  NetListWalk::WalkPreOrder(node, [&](IHdlNetListNode* current) {
    // The whole project (or a reduced unit tree) hangs below a root that has no file of its own.
    if (current == node && IsUnnamedRoot(current)) return NetListWalk::Step::kDescend;
    if (AddNodeDependencies(current, relaxed, status)) return NetListWalk::Step::kDescend;
    return status == CitI::kOk ? NetListWalk::Step::kSkipChildren : NetListWalk::Step::kStop;
  });
  if (status != CitI::kOk) return status;
  ChainVerilogFiles();
  if (orderArchitectures_) OrderArchitectureFiles();
  return status;
}

void CCompileOrder::NoteArchitecture(IHdlElement* element) {
  auto* architecture = Prjrep::ImplementationCast<Arch>(element);
  auto* record = Prjrep::ImplementationCast<CHdlElement>(element);
  if (!architecture || !record) return;
  Port::StringBase library;
  record->GetLibraryName(&library);
  library.Append(':');
  library.Append(architecture->GetEntityName().view());
  std::vector<IHdlElement*>& candidates = architectures_[library];
  if (std::find(candidates.begin(), candidates.end(), element) == candidates.end())
    candidates.push_back(element);
}

void CCompileOrder::OrderArchitectureFiles() {
  for (const auto& [entity, candidates] : architectures_) {
    if (candidates.size() < 2) continue;
    IHdlElement* chosen = ArchitectureChoice::Default(candidates);
    Prjrep::AutoPtr<IHdlFile> chosenFile;
    chosen->GetSourceFile(chosenFile.Out());
    auto last = vertices_.find(chosenFile.Get());
    if (last == vertices_.end()) continue;
    for (IHdlElement* other : candidates) {
      Prjrep::AutoPtr<IHdlFile> file;
      other->GetSourceFile(file.Out());
      auto before = vertices_.find(file.Get());
      if (before == vertices_.end() || before->second == last->second) continue;
      AddEdge(last->second, before->second);
      ++architectureEdges_;
    }
  }
}

void CCompileOrder::ChainVerilogFiles() {
  std::vector<Vertex> verilog;
  for (Vertex vertex : boost::make_iterator_range(boost::vertices(graph_))) {
    if (graph_[vertex].verilog) verilog.push_back(vertex);
  }
  // Equal keys (files added without one) by name, so the chain does not depend on addresses.
  std::stable_sort(verilog.begin(), verilog.end(), [&](Vertex a, Vertex b) {
    if (graph_[a].orderKey != graph_[b].orderKey) return graph_[a].orderKey > graph_[b].orderKey;
    return graph_[a].displayName.view() < graph_[b].displayName.view();
  });
  for (std::size_t i = 1; i < verilog.size(); ++i) AddEdge(verilog[i], verilog[i - 1]);
}

bool CCompileOrder::AddNodeDependencies(IHdlNetListNode* node, bool relaxed, CitI::Result& status) {
  Prjrep::AutoPtr<IHdlFile> file = NetListWalk::SourceFileOf(node);
  if (!file) return false;
  NoteArchitecture(node->GetElement());
  Vertex user = 0;
  status = GetFileVertex(file.Get(), &user);
  if (status != CitI::kOk) return false;
  for (IHdlNetListNode* child : NetListWalk::ChildrenOf(node)) {
    Prjrep::AutoPtr<IHdlFile> childFile = NetListWalk::SourceFileOf(child);
    if (!childFile) continue;
    Vertex used = 0;
    status = GetFileVertex(childFile.Get(), &used);
    if (status != CitI::kOk) return false;
    if (used == user) continue;
    if (graph_[user].verilog && graph_[used].verilog) continue;
    if (relaxed && !IsDeclarationUnit(child->GetElement())) continue;
    AddEdge(user, used);
  }
  return true;
}

void CCompileOrder::AddEdge(Vertex from, Vertex to) { boost::add_edge(from, to, 1, graph_); }

CitI::Result CCompileOrder::GetFileVertex(IHdlFile* file, Vertex* out) {
  if (!file || !out) return CitI::kInvalidArg;
  auto [entry, added] = vertices_.try_emplace(file, 0);
  if (added) {
    FileVertex vertex{DisplayNameOf(file), file};
    Port::StringBase plugin;
    file->getPluginName(&plugin);
    vertex.verilog = plugin.Equals(kVerilogPlugin, Port::kCompareNoCase);
    file->getOrderKey(&vertex.orderKey);
    entry->second = boost::add_vertex(std::move(vertex), graph_);
  }
  *out = entry->second;
  return CitI::kOk;
}

bool CCompileOrder::FindBackEdges() {
  backEdges_.clear();
  cycleFound_ = false;
  if (boost::num_vertices(graph_) == 0) return false;
  boost::depth_first_search(graph_, boost::visitor(BackEdgeRecorder(backEdges_, cycleFound_)));
  return cycleFound_;
}

CitI::Result CCompileOrder::ReportCycles(bool report) {
  FindBackEdges();
  if (!cycleFound_ || !report) return CitI::kOk;
  if (backEdges_.empty()) return CitI::kFail;
  std::vector<ListedCycle> cycles;
  ListAllCycles(cycles);
  for (const ListedCycle& cycle : cycles) {
    if (cycle.result != CitI::kOk) return cycle.result;
    if (cycle.files.empty()) return CitI::kFail;
    Message(__LINE__)->issueWarning("%s", CompileOrderText::kCycleHeader);
    for (Vertex vertex : cycle.files) {
      Message(__LINE__)->issueWarning(CompileOrderText::kCycleFileFormat, graph_[vertex].displayName.c_str());
    }
    Message(__LINE__)->issueWarning("%s", CompileOrderText::kCycleEnd);
  }
  return CitI::kOk;
}

// Back edges that end at one file share its search: many cycles through one file cost one search.
void CCompileOrder::ListAllCycles(std::vector<ListedCycle>& cycles) const {
  cycles.assign(backEdges_.size(), ListedCycle{});
  std::vector<std::size_t> byTarget(backEdges_.size());
  for (std::size_t k = 0; k < byTarget.size(); ++k) byTarget[k] = k;
  std::stable_sort(byTarget.begin(), byTarget.end(),
                   [&](std::size_t a, std::size_t b) { return backEdges_[a].second < backEdges_[b].second; });
  PathsToCycleStart paths;
  for (std::size_t k : byTarget) {
    const BackEdge& backEdge = backEdges_[k];
    if (paths.predecessor.empty() || paths.start != backEdge.second) {
      cycles[k].result = SearchFrom(backEdge.second, paths);
      if (cycles[k].result != CitI::kOk) {
        paths.predecessor.clear();
        continue;
      }
    }
    cycles[k].result = WalkCycle(backEdge, paths, cycles[k].files);
  }
}

CitI::Result CCompileOrder::SearchFrom(Vertex start, PathsToCycleStart& paths) const {
  const std::size_t count = boost::num_vertices(graph_);
  if (start >= count) return CitI::kInvalidArg;
  paths.start = start;
  paths.predecessor.assign(count, 0);
  paths.distance.assign(count, 0);
  auto index = boost::get(boost::vertex_index, graph_);
  boost::dijkstra_shortest_paths(
      graph_, start,
      boost::predecessor_map(boost::make_iterator_property_map(paths.predecessor.begin(), index))
          .distance_map(boost::make_iterator_property_map(paths.distance.begin(), index))
          .weight_map(boost::get(boost::edge_weight, graph_)));
  return CitI::kOk;
}

CitI::Result CCompileOrder::WalkCycle(const BackEdge& backEdge, const PathsToCycleStart& paths,
                                      std::vector<Vertex>& out) const {
  out.clear();
  const std::size_t count = boost::num_vertices(graph_);
  const auto [source, target] = backEdge;
  if (source >= count || target >= count) return CitI::kInvalidArg;
  // An unreached vertex is its own predecessor, so the walk also stops there rather than loop.
  for (Vertex current = source; current != target; current = paths.predecessor[current]) {
    if (paths.distance[current] < 0 || paths.distance[current] == kUnreached || out.size() >= count) {
      Port_MsgManData::debugStub("%s", CompileOrderText::kNoShortestPath);
      out.clear();
      return CitI::kFail;
    }
    out.push_back(current);
  }
  out.push_back(target);
  return CitI::kOk;
}

CitI::Result CCompileOrder::ListCycleFiles(const BackEdge& backEdge, std::vector<Vertex>& out) const {
  out.clear();
  const std::size_t count = boost::num_vertices(graph_);
  if (backEdge.first >= count || backEdge.second >= count) return CitI::kInvalidArg;
  PathsToCycleStart paths;
  CitI::Result status = SearchFrom(backEdge.second, paths);
  return status == CitI::kOk ? WalkCycle(backEdge, paths, out) : status;
}

CitI::Result CCompileOrder::BreakCycles() {
  for (const auto& [source, target] : backEdges_) boost::remove_edge(source, target, graph_);
  return CitI::kOk;
}

std::vector<std::int32_t> CCompileOrder::ComputeLevels(const std::vector<Vertex>& reverseTopological) const {
  std::vector<std::int32_t> level(boost::num_vertices(graph_), 0);
  // From the back, every user is met before the files it uses, so its level is final by then.
  for (auto vertex = reverseTopological.rbegin(); vertex != reverseTopological.rend(); ++vertex) {
    for (auto edge : boost::make_iterator_range(boost::in_edges(*vertex, graph_))) {
      level[*vertex] = std::max(level[*vertex], level[boost::source(edge, graph_)] + 1);
    }
  }
  return level;
}

CitI::Result CCompileOrder::EmitOrder(IHdlFileIterator** out) const {
  if (!out) return CitI::kInvalidArg;
  std::vector<Vertex> order;
  order.reserve(boost::num_vertices(graph_));
  try {
    boost::topological_sort(graph_, std::back_inserter(order));
  } catch (const boost::not_a_dag&) {
    return CitI::kFail;
  }
  const std::vector<std::int32_t> level = ComputeLevels(order);
  // Stable, so that the rare ties (equal level and equal folded name) keep one fixed order.
  std::stable_sort(order.begin(), order.end(), [&](Vertex a, Vertex b) {
    if (level[a] != level[b]) return level[a] > level[b];
    return graph_[a].displayName.Compare(graph_[b].displayName.view(), Port::kCompareNoCase) > 0;
  });

  auto files = Prjrep::TRefdSequenceSetHelper<IHdlFileSet>::New();
  for (Vertex vertex : order) {
    if (auto* file = Prjrep::QueryAs<IHdlFile>(graph_[vertex].file)) files->Add(file);
  }
  return files->CreateIterator(out);
}

}  // namespace Vad
