// The compile order of the source files below a hierarchy node: a dependency graph of files
// (an edge u->v when a unit of file u uses a unit of file v), cycle detection and reporting, a
// relaxed retry that keeps only the dependencies on entity and package declarations, and, as a
// last resort, cutting the cycles.
#pragma once

#include <boost/graph/adjacency_list.hpp>
#include <cstdint>
#include <map>
#include <utility>
#include <vector>

#include "CitI.h"
#include "HdlSets.h"
#include "Host/VhdlName.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "IHdlParserConfig.h"
#include "Port/StringBase.h"

namespace Vad {

class CElaborator;
class CLibRefs;

// The messages of the compile order, issued in category "ProjectMgmt" under the elaborator's
// source name.
namespace CompileOrderText {
inline constexpr const char* kStrictCycle =
    "File circular dependency detected using rule: define-before-use.\n";
inline constexpr const char* kRelaxing =
    "Relaxing define-before-use dependency to only entity and package declarations.\n";
inline constexpr const char* kRelaxedOrderValid =
    "A valid compile order was produced using the relaxed file dependency.\n";
inline constexpr const char* kRelaxedCycle =
    "File circular dependency detected using relaxed define-before-use rule for only entity and package "
    "declarations.\n";
inline constexpr const char* kBreaking = "Breaking file dependency loop(s) to create a compile order.\n";
inline constexpr const char* kUnbreakable = "Unable to break file file dependency cycle(s).\n";
inline constexpr const char* kNoValidOrder =
    "Due to the above cyclic loop(s) a valid compile order could not be generated.\n";
inline constexpr const char* kCycleHeader = "Found circular dependency consisting of the following files:\n";
// One line per file of a cycle: ten blanks and the file's display name.
inline constexpr const char* kCycleFileFormat = "          %s\n";
inline constexpr const char* kCycleEnd = "\n";
// Developer text (debug channel).
inline constexpr const char* kNoShortestPath = "Error: Unable to find shortest path";
// Display name of a file that cannot name itself.
inline constexpr const char* kUnnamedFile = "NULL PTR";
inline constexpr const char* kCategory = "ProjectMgmt";
inline constexpr const char* kSource = "../src/CElaborator";
}  // namespace CompileOrderText

// One computation: make an object on the stack, call ComputeCompileOrder once. Results: 1
// success, kInvalidArg (0x1100000000000003) for a missing argument, 0 failure.
class CCompileOrder {
 public:
  struct FileVertex {
    Port::StringBase displayName;
    IHdlFile* file = nullptr;  // borrowed from the tree's elements for the computation
    bool verilog = false;
    std::uint64_t orderKey = 0;  // the first source given has the largest
  };
  // Out-edges in insertion order (the depth-first searches follow it), all edges in one list;
  // parallel edges allowed, one per referencing node.
  using Graph = boost::adjacency_list<boost::vecS, boost::vecS, boost::bidirectionalS, FileVertex,
                                      boost::property<boost::edge_weight_t, std::int32_t>, boost::no_property,
                                      boost::listS>;
  using Vertex = Graph::vertex_descriptor;
  using BackEdge = std::pair<Vertex, Vertex>;

  // The source files of the tree below `node` in compile order, handed out through `out` (an
  // iterator over a file set). Cycles under the strict rule only are warnings; cycles that
  // survive the relaxed rule are cut with warnings and the order of the remaining graph is
  // delivered. `out` is cleared first. The unnamed root of a hierarchy contributes the subtrees
  // of all its children; any other node without an element or file contributes nothing.
  CitI::Result ComputeCompileOrder(IHdlNetListNode* node, IHdlFileIterator** out);
  // The compile order of the source files below `start` (or below `top` when it is given and
  // differs; with `byUnit` set, below the reduced tree of the unit at `top`, which `elaborator`
  // elaborates afresh with `libraryReferences`). Start node and out-parameter are required
  // (kInvalidArg).
  static CitI::Result OrderBelow(CElaborator& elaborator, CLibRefs* libraryReferences, IHdlNetListNode* start,
                                 IHdlNetListNode* top, IHdlParserConfig* parserConfig, bool byUnit,
                                 IHdlFileIterator** out);

  // ---- the steps, in the order ComputeCompileOrder takes them ----
  // Adds the files below `node` and their dependencies to the graph; vertices are numbered in
  // pre-order (a node's file, its children's files, then the subtrees). With `relaxed` set only
  // the dependencies on Entity and PackageDecl units become edges. Verilog files depend on each
  // other only through the order they were given in: each on the one given before it.
  CitI::Result BuildFileGraph(IHdlNetListNode* node, bool relaxed);
  // The vertex of `file`, added on first sight. kInvalidArg for a null file or out-parameter.
  CitI::Result GetFileVertex(IHdlFile* file, Vertex* out);
  // Depth-first search over all vertices (roots in index order, out-edges in insertion order)
  // that records the back edges it meets; true when there is one.
  bool FindBackEdges();
  // Runs the search again and, with `report` set, issues for every back edge the files of the
  // shortest cycle through it. 0 when a cycle cannot be listed.
  CitI::Result ReportCycles(bool report);
  // The files of the shortest cycle through `backEdge` s->t: s first, then against the edge
  // direction back to t. 0 (with a debug text) when no path from t to s exists.
  CitI::Result ListCycleFiles(const BackEdge& backEdge, std::vector<Vertex>& out) const;
  // ListCycleFiles for every recorded back edge, by index; each cycle start is searched once.
  struct ListedCycle {
    std::vector<Vertex> files;
    CitI::Result result = CitI::kOk;
  };
  void ListAllCycles(std::vector<ListedCycle>& cycles) const;
  // Removes every edge s->t of each recorded back edge; vertices and other edges stay.
  CitI::Result BreakCycles();
  // The files by level (length of the longest chain of files that use it), highest first, equal
  // levels by descending display name (letter case folded). 0 when the graph has a cycle.
  CitI::Result EmitOrder(IHdlFileIterator** out) const;

  // The shortest paths from one cycle start t, which every back edge s->t walks back to t.
  struct PathsToCycleStart {
    Vertex start = 0;
    std::vector<Vertex> predecessor;
    std::vector<std::int32_t> distance;
  };
  CitI::Result SearchFrom(Vertex start, PathsToCycleStart& paths) const;
  CitI::Result WalkCycle(const BackEdge& backEdge, const PathsToCycleStart& paths,
                         std::vector<Vertex>& out) const;

  // ---- for tests ----
  const Graph& GetGraph() const { return graph_; }
  const std::vector<BackEdge>& GetBackEdges() const { return backEdges_; }
  bool HasCycle() const { return cycleFound_; }

  // "directory + file name" as the file reports them, or "NULL PTR".
  static Port::StringBase DisplayNameOf(IHdlFile* file);

 private:
  // The relaxed retry after the strict rule met a cycle, with its messages.
  CitI::Result RelaxAfterStrictCycles(IHdlNetListNode* node);
  // Reports the cycles of the relaxed graph and cuts them; 0 when the cut graph still has one.
  CitI::Result CutRelaxedCycles();
  void ClearGraph();
  // Adds the vertex of the node's file and the edges to its children's files; false (and
  // nothing added) when the node has no file. `status` receives a failing step's result.
  bool AddNodeDependencies(IHdlNetListNode* node, bool relaxed, CitI::Result& status);
  void AddEdge(Vertex from, Vertex to);
  // Macros flow from file to file in the order the Verilog files were given, so that order is
  // kept; instances between Verilog files impose none.
  void ChainVerilogFiles();
  // Notes an architecture met in the walk, grouped by library and entity.
  void NoteArchitecture(IHdlElement* element);
  // The file of the architecture bound by default comes after the files of the entity's other
  // architectures, so that it is the one analysed last, as the hierarchy assumes.
  void OrderArchitectureFiles();
  std::vector<std::int32_t> ComputeLevels(const std::vector<Vertex>& reverseTopological) const;

  Graph graph_;
  std::map<IHdlFile*, Vertex> vertices_;
  // "library:entity" -> its architectures in the tree, each once.
  std::map<Port::StringBase, std::vector<IHdlElement*>, Host::VhdlNameLess> architectures_;
  // Cleared when the default architectures cannot come last without a cycle.
  bool orderArchitectures_ = true;
  std::size_t architectureEdges_ = 0;
  std::vector<BackEdge> backEdges_;
  bool cycleFound_ = false;
};

}  // namespace Vad
