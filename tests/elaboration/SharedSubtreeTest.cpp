// Shared subtrees and deep designs: a unit that several parents reference is built once and
// linked under each of them, which a walk through GetChildren cannot tell from expanding it again;
// chains far deeper than any call stack elaborate, order and free without recursion.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "CCompileOrder.h"
#include "CHdlProject.h"
#include "CLibRefs.h"
#include "CompInst.h"
#include "ElabFixtures.h"
#include "PackageDecl.h"
#include "ScopedTempDir.h"
#include "SeededRandom.h"
#include "Use.h"
#include "module.h"

using namespace elab_test;

namespace {

// What one elaboration gives a host: the tree as GetChildren shows it, the compile order and the
// messages of both steps.
struct Outcome {
  std::string tree;
  std::vector<std::string> order;
  std::vector<std::string> elaborationMessages;
  std::vector<std::string> orderMessages;
  std::size_t distinctNodes = 0;
};

// Messages in first-occurrence order without repeats; a cycle report (header, files, end) counts
// as one message.
std::vector<std::string> WithoutRepeats(const std::vector<std::string>& messages) {
  std::vector<std::string> unique;
  std::set<std::string> seen;
  std::string block;
  for (const std::string& message : messages) {
    block += message;
    if (block.find(Vad::CompileOrderText::kCycleHeader) != std::string::npos &&
        message.substr(message.find(": ") + 2) != Vad::CompileOrderText::kCycleEnd)
      continue;
    if (seen.insert(block).second) unique.push_back(block);
    block.clear();
  }
  return unique;
}

class SharedSubtrees : public ElabTest {
 protected:
  static std::vector<std::string> FileNames(Vad::IHdlFileIterator* files) {
    std::vector<std::string> names;
    for (; files && !files->IsDone(); files->Next()) {
      Port::StringBase directory;
      Port::StringBase name;
      files->Current()->getFileName(&directory, &name);
      names.push_back(name.str());
    }
    return names;
  }

  Outcome Run(Vad::IHdlDesignUnitIterator* units, bool share) {
    Outcome outcome;
    Vad::CElaborator elaborator;
    elaborator.SetShareSubtrees(share);
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    {
      MessageLog log;
      EXPECT_EQ(elaborator.Elaborate(References(), units, root.Out()), CitI::kOk);
      outcome.elaborationMessages = log.Lines();
    }
    if (!root) return outcome;
    std::set<Vad::IHdlNetListNode*> distinct;
    outcome.tree = Render(root.Get(), false, &distinct);
    outcome.distinctNodes = distinct.size();
    MessageLog log;
    Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
    EXPECT_EQ(Vad::CCompileOrder::OrderBelow(elaborator, References(), root.Get(), nullptr, nullptr, false,
                                             files.Out()),
              CitI::kOk);
    outcome.order = FileNames(files.Get());
    outcome.orderMessages = log.Lines();
    return outcome;
  }

  Outcome RunOnProject(bool share) {
    Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
    EXPECT_EQ(ProjectObject()->getAllDesignUnits(units.Out()), CitI::kOk);
    Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> unit;
    EXPECT_EQ(units->CreateIterator(unit.Out()), CitI::kOk);
    return Run(unit.Get(), share);
  }
};

// A VHDL project of packages using packages and entities whose architectures instantiate each
// other, unknown units and a library cell; with `cycles`, references may also point back.
class RandomProject {
 public:
  RandomProject(std::uint64_t seed, bool cycles) : random_(seed), cycles_(cycles) {}

  std::vector<std::string> Write(const ScopedTempDir& dir) {
    int packages = 2 + random_.Below(5);
    int entities = 2 + random_.Below(5);
    std::vector<std::string> paths;
    for (int i = 0; i < packages; ++i) {
      std::string text = Uses(i, packages);
      text += "package pk_" + std::to_string(i) + " is\nend package;\n";
      paths.push_back(Save(dir, "pk_" + std::to_string(i) + ".vhd", text));
    }
    for (int i = 0; i < entities; ++i) {
      std::string text = Uses(packages, packages) + "entity en_" + std::to_string(i) + " is\nend entity;\n";
      text += "architecture rtl of en_" + std::to_string(i) + " is\nbegin\n";
      int instances = random_.Below(4);
      for (int k = 0; k < instances; ++k) text += Instance(i, k, entities);
      text += "end architecture;\n";
      paths.push_back(Save(dir, "en_" + std::to_string(i) + ".vhd", text));
    }
    return paths;
  }

 private:
  // Use clauses of up to two packages; without cycles only of packages below `self`.
  std::string Uses(int self, int packages) {
    std::string text;
    int limit = cycles_ ? packages : self;
    for (int k = 0; k < 2 && limit > 0; ++k) {
      if (random_.Chance(60)) text += "use work.pk_" + std::to_string(random_.Below(limit)) + ".all;\n";
    }
    return text;
  }

  std::string Instance(int self, int k, int entities) {
    std::string label = "u" + std::to_string(k);
    int kind = random_.Below(4);
    int lowest = cycles_ ? 0 : self + 1;
    if (kind >= 2 && lowest < entities) {
      std::string target = "en_" + std::to_string(lowest + random_.Below(entities - lowest));
      if (kind == 2) return "  " + label + " : " + target + ";\n";
      return "  " + label + " : entity work." + target + ";\n";
    }
    if (kind == 1) return "  " + label + " : QL_INV;\n";
    return "  " + label + " : ghost_" + std::to_string(random_.Below(3)) + ";\n";
  }

  static std::string Save(const ScopedTempDir& dir, const std::string& name, const std::string& text) {
    std::string path = dir.Path(name);
    std::ofstream(path) << text;
    return path;
  }

  SeededRandom random_;
  bool cycles_;
};

TEST_F(SharedSubtrees, SharedAndExpandedBuildsLookTheSameOnRandomProjects) {
  int sharing = 0;
  int cycles = 0;
  for (std::uint64_t seed = 1; seed <= 40; ++seed) {
    SCOPED_TRACE("seed " + std::to_string(seed));
    project_ = NewProject();
    ScopedTempDir dir;
    for (const std::string& path : RandomProject(seed, seed % 2 == 0).Write(dir)) AddFile(path);
    Outcome expanded = RunOnProject(false);
    Outcome shared = RunOnProject(true);
    ASSERT_FALSE(expanded.tree.empty());
    EXPECT_EQ(shared.tree, expanded.tree);
    EXPECT_EQ(shared.order, expanded.order);
    EXPECT_LE(shared.distinctNodes, expanded.distinctNodes);
    // A cycle cut inside a subtree that is built once is reported once.
    EXPECT_EQ(WithoutRepeats(shared.elaborationMessages), WithoutRepeats(expanded.elaborationMessages));
    EXPECT_EQ(WithoutRepeats(shared.orderMessages), WithoutRepeats(expanded.orderMessages));
    if (shared.distinctNodes < expanded.distinctNodes) ++sharing;
    if (!expanded.elaborationMessages.empty()) ++cycles;
  }
  // The projects do share subtrees and do have cycles.
  EXPECT_GT(sharing, 10);
  EXPECT_GT(cycles, 5);
}

class DeepHierarchy : public SharedSubtrees {
 protected:
  Vad::IHdlFile* File(const std::string& path, std::string_view plugin) {
    files_.push_back(MakeFile(path, "work", plugin));
    return files_.back().Get();
  }

  // The units made so far, use clauses aside.
  Prjrep::AutoPtr<Vad::IHdlNetListNode> Elaborate(Vad::CElaborator& elaborator) {
    std::vector<CitI::IInterface*> designUnits;
    for (const auto& unit : units_)
      if (RecordOf<Vad::DbObject>(unit.Get())->GetType() != Vad::DbType::kUse)
        designUnits.push_back(unit.Get());
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    EXPECT_EQ(elaborator.Elaborate(References(), IterateUnits(designUnits).Get(), root.Out()), CitI::kOk);
    return root;
  }

  // The nodes from `top` down along the first child, and the last one's path.
  static std::size_t DepthAlongFirstChildren(Vad::IHdlNetListNode* top, std::string& lastPath) {
    std::size_t depth = 1;
    for (std::vector<Vad::IHdlNetListNode*> children; !(children = ChildrenOf(top)).empty(); ++depth)
      top = children.front();
    lastPath = PathOf(top);
    return depth;
  }

  std::vector<Prjrep::AutoPtr<Vad::IHdlFile>> files_;
};

// Deep enough that a walk recursing once per level overflows the stack of the sanitizer build.
constexpr int kChainDepth = 30000;
constexpr int kUnitsPerFile = 1000;

TEST_F(DeepHierarchy, InstanceChainAndPackageChainElaborateOrderAndFree) {
  for (int i = 0; i < kChainDepth; ++i) {
    std::string suffix = std::to_string(i / kUnitsPerFile);
    Vad::IHdlFile* verilog = i % kUnitsPerFile == 0 ? File("/chain/m" + suffix + ".v", "PLUGIN_Verilog")
                                                    : files_[files_.size() - 2].Get();
    Vad::IHdlFile* vhdl =
        i % kUnitsPerFile == 0 ? File("/chain/p" + suffix + ".vhd", "PLUGIN_Vhdl") : files_.back().Get();
    CitI::IInterface* module = Unit<Vad::module>(verilog, "m" + std::to_string(i), nullptr);
    CitI::IInterface* package = Unit<Vad::PackageDecl>(vhdl, "p" + std::to_string(i), nullptr);
    if (i + 1 < kChainDepth) {
      Component(module, "u", "m" + std::to_string(i + 1));
      Uses(package, "work.p" + std::to_string(i + 1) + ".all");
    }
  }
  Vad::CElaborator elaborator;
  MessageLog log;
  auto root = Elaborate(elaborator);
  ASSERT_TRUE(root);
  std::vector<Vad::IHdlNetListNode*> tops = ChildrenOf(root.Get());
  ASSERT_EQ(tops.size(), 2u);
  std::string lastPath;
  EXPECT_EQ(DepthAlongFirstChildren(tops[0], lastPath), static_cast<std::size_t>(kChainDepth));
  // "/m0" and "/u" for every instance below it.
  EXPECT_EQ(lastPath.size(), 3u + 2u * (kChainDepth - 1));
  EXPECT_EQ(DepthAlongFirstChildren(tops[1], lastPath), static_cast<std::size_t>(kChainDepth));

  Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
  ASSERT_EQ(Vad::CCompileOrder::OrderBelow(elaborator, References(), root.Get(), nullptr, nullptr, false,
                                           files.Out()),
            CitI::kOk);
  std::vector<std::string> order = FileNames(files.Get());
  // Each package file after the one it uses; the Verilog files in the order given (equal order
  // keys, so by name), since instances between Verilog files impose no order.
  std::vector<std::string> packages, modules, expectedPackages, expectedModules;
  for (const std::string& name : order) (name.ends_with(".vhd") ? packages : modules).push_back(name);
  for (int k = kChainDepth / kUnitsPerFile - 1; k >= 0; --k) {
    expectedPackages.push_back("p" + std::to_string(k) + ".vhd");
    expectedModules.push_back("m" + std::to_string(k) + ".v");
  }
  std::sort(expectedModules.begin(), expectedModules.end());
  EXPECT_EQ(packages, expectedPackages);
  EXPECT_EQ(modules, expectedModules);
  EXPECT_TRUE(log.Records().empty());
}

TEST_F(DeepHierarchy, PackageUsedByManyUnitsIsOneNodeWithEveryParent) {
  Vad::IHdlFile* file = File("/src/diamond.vhd", "PLUGIN_Vhdl");
  Uses(Unit<Vad::PackageDecl>(file, "common", nullptr), "work.base.all");
  Unit<Vad::PackageDecl>(file, "base", nullptr);
  constexpr int kUsers = 3;
  for (int i = 0; i < kUsers; ++i)
    Uses(Unit<Vad::PackageDecl>(file, "user" + std::to_string(i), nullptr), "work.common.all");
  Vad::CElaborator elaborator;
  auto root = Elaborate(elaborator);
  ASSERT_TRUE(root);
  std::vector<Vad::IHdlNetListNode*> tops = ChildrenOf(root.Get());
  ASSERT_EQ(tops.size(), static_cast<std::size_t>(kUsers));
  Vad::IHdlNetListNode* shared = ChildrenOf(tops[0]).front();
  EXPECT_EQ(NameOf(shared), "work:PackageDecl|common");
  for (Vad::IHdlNetListNode* top : tops)
    EXPECT_EQ(ChildrenOf(top), std::vector<Vad::IHdlNetListNode*>{shared});
  Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> parent;
  ASSERT_EQ(shared->GetParents(parent.Out()), CitI::kOk);
  std::vector<Vad::IHdlNetListNode*> parents;
  for (; !parent->IsDone(); parent->Next()) parents.push_back(parent->Current());
  EXPECT_EQ(parents, tops);
  EXPECT_EQ(NameOf(ChildrenOf(shared).front()), "work:PackageDecl|base");

  // A parent that goes leaves the others listed.
  Prjrep::AutoPtr<Vad::IHdlNetListNode> kept(shared);
  root = nullptr;
  tops.clear();
  Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> left;
  ASSERT_EQ(kept->GetParents(left.Out()), CitI::kOk);
  EXPECT_TRUE(left->IsDone());
}

}  // namespace
