// The file dependency graph itself: vertex numbering, strict and relaxed edges, cycle search,
// cutting, and trees put together by hand.
#include <gtest/gtest.h>

#include <algorithm>
#include <utility>

#include "OrderFixtures.h"
#include "Port/MsgManData.h"

using namespace order_test;
using Graph = Vad::CCompileOrder::Graph;

namespace {

class CompileOrderGraph : public OrderTest {
 protected:
  static Strings VertexNames(const Graph& graph) {
    Strings names;
    for (auto vertex : boost::make_iterator_range(boost::vertices(graph))) {
      std::string path = graph[vertex].displayName.str();
      names.push_back(path.substr(path.rfind('/') + 1));
    }
    return names;
  }

  static Strings EdgeNames(const Graph& graph) {
    Strings names = VertexNames(graph);
    Strings edges;
    for (auto edge : boost::make_iterator_range(boost::edges(graph))) {
      edges.push_back(names[boost::source(edge, graph)] + "->" + names[boost::target(edge, graph)]);
      EXPECT_EQ(boost::get(boost::edge_weight, graph, edge), 1);
    }
    std::sort(edges.begin(), edges.end());
    return edges;
  }

  static Prjrep::AutoPtr<Vad::IHdlNetListNode> NewNode(Vad::IHdlNetListNode* parent, CitI::IInterface* unit,
                                                       std::string_view name = "") {
    auto node = Prjrep::CreateInstanceAs<Vad::IHdlNetListNode>(Vad::ClassIds::CNetListNode());
    auto* internal = Prjrep::QueryAs<Vad::IHdlNetListNodeInternal>(node.Get());
    EXPECT_EQ(internal->SetName(Port::StringBase(name)), CitI::kOk);
    if (unit) {
      EXPECT_EQ(internal->SetElement(Prjrep::QueryAs<Vad::IHdlElement>(unit)), CitI::kOk);
    }
    if (parent) {
      EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlNetListNodeInternal>(parent)->AddChild(node.Get()), CitI::kOk);
    }
    return node;
  }

  static Strings Order(Vad::IHdlNetListNode* node) {
    Vad::CCompileOrder order;
    Prjrep::AutoPtr<Vad::IHdlFileIterator> files;
    EXPECT_EQ(order.ComputeCompileOrder(node, files.Out()), CitI::kOk);
    return FileNames(files.Get());
  }
};

TEST_F(CompileOrderGraph, VerticesFollowThePreOrderWalkAndTheRelaxedRuleKeepsDeclarationEdges) {
  AddFiles("split", {"a_ent.vhd", "a_rtl.vhd", "b_ent.vhd", "b_rtl.vhd"});
  auto root = Root();
  Vad::CCompileOrder order;
  ASSERT_EQ(order.BuildFileGraph(root.Get(), false), CitI::kOk);
  EXPECT_EQ(VertexNames(order.GetGraph()), (Strings{"a_rtl.vhd", "b_rtl.vhd", "a_ent.vhd", "b_ent.vhd"}));
  EXPECT_EQ(EdgeNames(order.GetGraph()), (Strings{"a_rtl.vhd->a_ent.vhd", "a_rtl.vhd->b_rtl.vhd",
                                                  "b_rtl.vhd->a_rtl.vhd", "b_rtl.vhd->b_ent.vhd"}));
  EXPECT_TRUE(order.FindBackEdges());
  EXPECT_EQ(order.GetBackEdges(), (std::vector<Vad::CCompileOrder::BackEdge>{{1, 0}}));

  Vad::CCompileOrder relaxed;
  ASSERT_EQ(relaxed.BuildFileGraph(root.Get(), true), CitI::kOk);
  EXPECT_EQ(VertexNames(relaxed.GetGraph()), VertexNames(order.GetGraph()));
  EXPECT_EQ(EdgeNames(relaxed.GetGraph()), (Strings{"a_rtl.vhd->a_ent.vhd", "b_rtl.vhd->b_ent.vhd"}));
  EXPECT_FALSE(relaxed.FindBackEdges());
  EXPECT_TRUE(relaxed.GetBackEdges().empty());
}

TEST_F(CompileOrderGraph, CuttingRemovesEveryParallelBackEdgeAndKeepsTheRest) {
  AddFiles("tangled", {"x.vhd", "y.vhd"});
  auto root = Root();
  Vad::CCompileOrder order;
  ASSERT_EQ(order.BuildFileGraph(root.Get(), false), CitI::kOk);
  EXPECT_EQ(EdgeNames(order.GetGraph()),
            (Strings{"x.vhd->y.vhd", "x.vhd->y.vhd", "y.vhd->x.vhd", "y.vhd->x.vhd"}));
  ASSERT_TRUE(order.FindBackEdges());
  EXPECT_EQ(order.GetBackEdges(), (std::vector<Vad::CCompileOrder::BackEdge>{{1, 0}, {1, 0}}));
  ASSERT_EQ(order.BreakCycles(), CitI::kOk);
  EXPECT_EQ(boost::num_vertices(order.GetGraph()), 2u);
  EXPECT_EQ(EdgeNames(order.GetGraph()), (Strings{"x.vhd->y.vhd", "x.vhd->y.vhd"}));
  EXPECT_FALSE(order.FindBackEdges());
  EXPECT_FALSE(order.HasCycle());
}

TEST_F(CompileOrderGraph, ACycleWithoutAPathBackIsNotListed) {
  AddFiles("package", {"shared.vhd", "user.vhd"});
  auto root = Root();
  Vad::CCompileOrder order;
  ASSERT_EQ(order.BuildFileGraph(root.Get(), false), CitI::kOk);
  ASSERT_EQ(VertexNames(order.GetGraph()), (Strings{"user.vhd", "shared.vhd"}));

  std::vector<Vad::CCompileOrder::Vertex> cycle{7};
  Port_DebugCapture debug;
  // Nothing leads from shared.vhd back to user.vhd.
  EXPECT_EQ(order.ListCycleFiles({0, 1}, cycle), CitI::kFail);
  EXPECT_TRUE(cycle.empty());
  EXPECT_EQ(debug.text(), Vad::CompileOrderText::kNoShortestPath);
  EXPECT_EQ(order.ListCycleFiles({0, 9}, cycle), CitI::kInvalidArg);

  ASSERT_EQ(order.ListCycleFiles({1, 0}, cycle), CitI::kOk);
  EXPECT_EQ(cycle, (std::vector<Vad::CCompileOrder::Vertex>{1, 0}));
}

TEST_F(CompileOrderGraph, CyclesThroughOneFileAreListedAsOneByOne) {
  // hub uses a, b and c, each of which uses hub; c and d use each other.
  AddFiles("hub", {"hub.vhd", "a.vhd", "b.vhd", "c.vhd", "d.vhd"});
  auto root = Root();
  Vad::CCompileOrder order;
  ASSERT_EQ(order.BuildFileGraph(root.Get(), false), CitI::kOk);
  ASSERT_TRUE(order.FindBackEdges());
  const auto& backEdges = order.GetBackEdges();
  ASSERT_EQ(backEdges.size(), 4u);

  std::vector<Vad::CCompileOrder::ListedCycle> cycles;
  order.ListAllCycles(cycles);
  ASSERT_EQ(cycles.size(), backEdges.size());
  Strings names = VertexNames(order.GetGraph());
  Strings listed;
  for (std::size_t k = 0; k < backEdges.size(); ++k) {
    std::vector<Vad::CCompileOrder::Vertex> alone;
    ASSERT_EQ(order.ListCycleFiles(backEdges[k], alone), CitI::kOk);
    EXPECT_EQ(cycles[k].result, CitI::kOk);
    EXPECT_EQ(cycles[k].files, alone) << "back edge " << k;
    std::string cycle;
    for (auto vertex : cycles[k].files) cycle += names[vertex] + " ";
    listed.push_back(cycle);
  }
  std::sort(listed.begin(), listed.end());
  EXPECT_EQ(listed, (Strings{"b.vhd hub.vhd ", "c.vhd hub.vhd ", "d.vhd c.vhd ", "hub.vhd a.vhd "}));
}

TEST_F(CompileOrderGraph, OnlyTheUnnamedRootStandsForTheSubtreesOfItsChildren) {
  AddFiles("package", {"shared.vhd", "user.vhd", "loner.vhd"});
  auto user = Unit("Architecture|user|rtl");
  auto shared = Unit("PackageDecl|shared");
  auto loner = Unit("Entity|loner");

  auto root = NewNode(nullptr, nullptr);
  auto userNode = NewNode(root.Get(), user.Get(), "Architecture|user|rtl");
  NewNode(userNode.Get(), shared.Get(), "PackageDecl|shared");
  NewNode(root.Get(), loner.Get(), "Entity|loner");
  EXPECT_EQ(Order(root.Get()), (Strings{"shared.vhd", "user.vhd", "loner.vhd"}));

  // A named node without an element, or an element without a file, contributes nothing below it.
  auto named = NewNode(nullptr, nullptr, "work:Entity|missing");
  NewNode(named.Get(), loner.Get());
  EXPECT_EQ(Order(named.Get()), Strings{});

  auto holder = NewNode(nullptr, user.Get());
  auto inner = NewNode(holder.Get(), nullptr);  // unnamed, but it has a parent
  NewNode(inner.Get(), loner.Get());
  EXPECT_EQ(Order(inner.Get()), Strings{});
  EXPECT_EQ(Order(holder.Get()), Strings{"user.vhd"});
}

TEST_F(CompileOrderGraph, AFileGetsOneVertexAndNamesItselfByItsFullPath) {
  auto file = AddFile("single", "alu.vhd");
  Vad::CCompileOrder order;
  Vad::CCompileOrder::Vertex first = 9;
  Vad::CCompileOrder::Vertex again = 9;
  EXPECT_EQ(order.GetFileVertex(nullptr, &first), CitI::kInvalidArg);
  EXPECT_EQ(order.GetFileVertex(file.Get(), nullptr), CitI::kInvalidArg);
  ASSERT_EQ(order.GetFileVertex(file.Get(), &first), CitI::kOk);
  ASSERT_EQ(order.GetFileVertex(file.Get(), &again), CitI::kOk);
  EXPECT_EQ(first, 0u);
  EXPECT_EQ(again, 0u);
  EXPECT_EQ(boost::num_vertices(order.GetGraph()), 1u);
  EXPECT_EQ(order.GetGraph()[0].displayName.str(), DataPath("single", "alu.vhd"));
  EXPECT_EQ(order.GetGraph()[0].file, file.Get());
  EXPECT_EQ(Vad::CCompileOrder::DisplayNameOf(nullptr).str(), Vad::CompileOrderText::kUnnamedFile);
  EXPECT_EQ(order.BuildFileGraph(nullptr, false), CitI::kInvalidArg);
}

}  // namespace
