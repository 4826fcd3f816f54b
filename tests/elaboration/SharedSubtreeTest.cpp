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
  std::vector<std::string> tree;
  std::vector<std::string> order;
  std::vector<std::string> elaborationMessages;
  std::vector<std::string> orderMessages;
  std::size_t distinctNodes = 0;
};

std::vector<std::string> MessageTexts(const MessageLog& log) {
  std::vector<std::string> texts;
  for (const Port_MsgRecord& record : log.Records())
    texts.push_back(std::to_string(record.type) + record.text);
  return texts;
}

// Messages in first-occurrence order without repeats; a cycle report (header, files, end) counts
// as one message.
std::vector<std::string> WithoutRepeats(const std::vector<std::string>& messages) {
  std::vector<std::string> blocks;
  bool inCycle = false;
  for (const std::string& message : messages) {
    if (inCycle) {
      blocks.back() += message;
      inCycle = message.substr(1) != Vad::CompileOrderText::kCycleEnd;
      continue;
    }
    blocks.push_back(message);
    inCycle = message.find(Vad::CompileOrderText::kCycleHeader) != std::string::npos;
  }
  std::vector<std::string> unique;
  std::set<std::string> seen;
  for (const std::string& block : blocks) {
    if (seen.insert(block).second) unique.push_back(block);
  }
  return unique;
}

class SharedSubtrees : public ElabTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  // Every node below the root in pre-order, one line each: depth, name, label, path, type, file
  // and the library-cell flag, as a host walking GetChildren sees them.
  static std::vector<std::string> Walk(Vad::IHdlNetListNode* root,
                                       std::set<Vad::IHdlNetListNode*>& distinct) {
    std::vector<std::string> lines;
    std::vector<std::pair<Vad::IHdlNetListNode*, int>> pending{{root, 0}};
    while (!pending.empty()) {
      auto [node, depth] = pending.back();
      pending.pop_back();
      distinct.insert(node);
      Port::StringBase label;
      Port::StringBase path;
      Port::StringBase type;
      node->GetInstanceName(&label);
      auto* tcl = Prjrep::QueryAs<UtilI::ITclCollectable>(node);
      tcl->GetName(&path);
      tcl->GetType(&type);
      lines.push_back(std::to_string(depth) + " " + NameOf(node) + " [" + label.str() + "] {" + path.str() +
                      "} " + type.str() + " @" + FileNameOf(node) + (node->IsLibraryCell() ? " cell" : ""));
      std::vector<Vad::IHdlNetListNode*> children = ChildrenOf(node);
      for (auto child = children.rbegin(); child != children.rend(); ++child)
        pending.emplace_back(*child, depth + 1);
    }
    return lines;
  }

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

  Outcome Run(bool share) {
    Outcome outcome;
    Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
    EXPECT_EQ(ProjectObject(project_.Get())->getAllDesignUnits(units.Out()), CitI::kOk);
    Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> unit;
    EXPECT_EQ(units->CreateIterator(unit.Out()), CitI::kOk);
    Prjrep::AutoRelease<Vad::CElaborator> elaborator(new Vad::CElaborator);
    elaborator->SetShareSubtrees(share);
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    {
      MessageLog log;
      EXPECT_EQ(elaborator->Elaborate(References(), unit.Get(), root.Out()), CitI::kOk);
      outcome.elaborationMessages = MessageTexts(log);
    }
    if (!root) return outcome;
    std::set<Vad::IHdlNetListNode*> distinct;
    outcome.tree = Walk(root.Get(), distinct);
    outcome.distinctNodes = distinct.size();
    MessageLog log;
    Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
    EXPECT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), References(), root.Get(), nullptr, nullptr,
                                             false, files.Out()),
              CitI::kOk);
    outcome.order = FileNames(files.Get());
    outcome.orderMessages = MessageTexts(log);
    return outcome;
  }

  Vad::CLibRefs* References() const { return ProjectObject(project_.Get())->getLibraryReferences(); }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
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
    for (const std::string& path : RandomProject(seed, seed % 2 == 0).Write(dir))
      AddFile(project_.Get(), path);
    Outcome expanded = Run(false);
    Outcome shared = Run(true);
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
  CitI::IInterface* Keep(Prjrep::AutoRelease<CitI::IInterface> unit) {
    units_.push_back(unit);
    return unit.Get();
  }
  Vad::IHdlFile* File(const std::string& path, std::string_view plugin) {
    files_.push_back(NewFile(project_.Get(), path, "work", plugin));
    return files_.back().Get();
  }
  // `unit` uses package `package` of the working library.
  void Uses(CitI::IInterface* unit, const std::string& package, Vad::IHdlFile* file) {
    CitI::IInterface* use = Keep(MakeUnit<Vad::Use>(file, "work." + package + ".all", nullptr));
    auto* vhdlUnit = RecordOf<Vad::CVhdlDU>(unit);
    std::vector<Vad::DbObject*> uses;
    vhdlUnit->GetUses(uses);
    uses.push_back(RecordOf<Vad::DbObject>(use));
    vhdlUnit->SetUses(uses);
  }

  Prjrep::AutoPtr<Vad::IHdlNetListNode> Elaborate(Vad::CElaborator& elaborator) {
    std::vector<CitI::IInterface*> designUnits;
    for (const auto& unit : units_) {
      if (RecordOf<Vad::DbObject>(unit.Get())->GetType() != Vad::DbType::kUse)
        designUnits.push_back(unit.Get());
    }
    auto iterator = IterateUnits(designUnits);
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    EXPECT_EQ(elaborator.Elaborate(References(), iterator.Get(), root.Out()), CitI::kOk);
    return root;
  }

  // The nodes from `top` down along the first child, and the last one's path.
  static std::size_t DepthAlongFirstChildren(Vad::IHdlNetListNode* top, std::string& lastPath) {
    std::size_t depth = 0;
    Vad::IHdlNetListNode* last = nullptr;
    for (Vad::IHdlNetListNode* node = top; node; ++depth) {
      last = node;
      std::vector<Vad::IHdlNetListNode*> children = ChildrenOf(node);
      node = children.empty() ? nullptr : children.front();
    }
    Port::StringBase path;
    Prjrep::QueryAs<UtilI::ITclCollectable>(last)->GetName(&path);
    lastPath = path.str();
    return depth;
  }

  std::vector<Prjrep::AutoRelease<CitI::IInterface>> units_;
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
    CitI::IInterface* module = Keep(MakeUnit<Vad::module>(verilog, "m" + std::to_string(i), nullptr));
    if (i + 1 < kChainDepth) {
      Prjrep::AutoRelease<CitI::IInterface> instance(
          new Vad::CompInst("u", "m" + std::to_string(i + 1), RecordOf<Vad::DbObject>(module)));
      CitI::IInterface* package = Keep(MakeUnit<Vad::PackageDecl>(vhdl, "p" + std::to_string(i), nullptr));
      Uses(package, "p" + std::to_string(i + 1), vhdl);
    } else {
      Keep(MakeUnit<Vad::PackageDecl>(vhdl, "p" + std::to_string(i), nullptr));
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
  CitI::IInterface* common = Keep(MakeUnit<Vad::PackageDecl>(file, "common", nullptr));
  Uses(common, "base", file);
  Keep(MakeUnit<Vad::PackageDecl>(file, "base", nullptr));
  constexpr int kUsers = 3;
  for (int i = 0; i < kUsers; ++i) {
    CitI::IInterface* user = Keep(MakeUnit<Vad::PackageDecl>(file, "user" + std::to_string(i), nullptr));
    Uses(user, "common", file);
  }
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
