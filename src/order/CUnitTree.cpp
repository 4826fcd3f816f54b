#include "CUnitTree.h"

#include <cstdint>
#include <map>
#include <vector>

#include "CElaborator.h"
#include "DbObject.h"
#include "HdlSets.h"
#include "IHdlDesignUnit.h"
#include "NetListWalk.h"
#include "Port/InitObjects.h"
#include "Prjrep/Casts.h"
#include "Prjrep/TListIter.h"

namespace Vad {
namespace {

using UnitMarks = std::map<IHdlElement*, std::int32_t>;

bool IsKnownUnit(IHdlDesignUnit* unit) {
  auto* object = Prjrep::ImplementationCast<DbObject>(unit);
  return object && (object->GetType() & ElabMask::kKnownUnit);
}

// Marks every element of `elements`; true when one of them was not marked before.
bool Mark(const CUnitTree::ElementSet& elements, UnitMarks& marks) {
  bool grew = false;
  for (IHdlElement* element : elements) grew = marks.try_emplace(element, 1).second || grew;
  return grew;
}

Prjrep::AutoRelease<IHdlDesignUnitIterator> IterateMarkedUnits(const UnitMarks& marks) {
  std::vector<IHdlDesignUnit*> units;
  units.reserve(marks.size());
  for (const auto& [element, mark] : marks) {
    if (auto* unit = Prjrep::QueryAs<IHdlDesignUnit>(element)) units.push_back(unit);
  }
  return Prjrep::TInterfaceListIter<IHdlDesignUnitIterator>::New(units);
}

// The first node in pre-order below `start` of each element, found in one walk instead of one
// walk per unit.
std::map<CitI::IInterface*, IHdlNetListNode*> FirstNodeOfEachElement(IHdlNetListNode* start) {
  std::map<CitI::IInterface*, IHdlNetListNode*> firstNodes;
  NetListWalk::WalkPreOrder(start, [&](IHdlNetListNode* node) {
    if (CitI::IInterface* element = NetListWalk::Identity(node->GetElement()))
      firstNodes.try_emplace(element, node);
    return NetListWalk::Step::kDescend;
  });
  return firstNodes;
}

}  // namespace

CitI::Result CUnitTree::BuildUnitTree(IHdlProject* project, IHdlNetListNode* start, IHdlNetListNode* top,
                                      IHdlParserConfig* parserConfig,
                                      Prjrep::AutoPtr<IHdlNetListNode>& tree) {
  if (!project || !start || !top || !parserConfig) return CitI::kInvalidArg;
  ElementSet extra;
  CitI::Result status = CollectExtraUnits(start, top, parserConfig, extra);
  if (status != CitI::kOk) return status;
  tree = top;
  if (extra.empty()) return CitI::kOk;

  ElementSet topElements;
  CollectTreeElements(top, topElements);
  UnitMarks marks;
  Mark(topElements, marks);
  // A unit that the new tree still leaves out although it was handed in would come back every
  // round; once a round adds nothing new, the tree cannot change any more.
  while (!extra.empty() && Mark(extra, marks)) {
    Prjrep::AutoRelease<IHdlDesignUnitIterator> units = IterateMarkedUnits(marks);
    Prjrep::AutoPtr<IHdlNetListNode> root;
    status = elaborator_.Elaborate(project, units.Get(), root.Out());
    if (status != CitI::kOk) return status;
    tree = root;
    status = CollectExtraUnits(start, root.Get(), parserConfig, extra);
    if (status != CitI::kOk) return status;
  }
  return CitI::kOk;
}

CitI::Result CUnitTree::CollectExtraUnits(IHdlNetListNode* start, IHdlNetListNode* tree,
                                          IHdlParserConfig* parserConfig, ElementSet& out) {
  out.clear();
  ElementSet treeElements;
  CollectTreeElements(tree, treeElements);
  FileSet files;
  CollectTreeFiles(tree, files);
  std::map<CitI::IInterface*, IHdlNetListNode*> firstNodes;
  bool indexed = false;
  for (IHdlFile* file : files) {
    Prjrep::AutoRelease<IHdlDesignUnitIterator> unit;
    CitI::Result status = file->getDesignUnits(parserConfig, unit.Out());
    if (status != CitI::kOk) return status;
    if (!unit) continue;
    for (; !unit->IsDone(); unit->Next()) {
      if (!IsKnownUnit(unit->Current())) continue;
      auto* element = Prjrep::QueryAs<IHdlElement>(unit->Current());
      if (!element || treeElements.contains(element)) continue;
      if (!indexed) {
        firstNodes = FirstNodeOfEachElement(start);
        indexed = true;
      }
      auto node = firstNodes.find(NetListWalk::Identity(element));
      if (node != firstNodes.end()) CollectTreeElements(node->second, out);
    }
  }
  return CitI::kOk;
}

void CUnitTree::CollectTreeElements(IHdlNetListNode* node, ElementSet& out) {
  NetListWalk::WalkPreOrder(node, [&](IHdlNetListNode* current) {
    if (IHdlElement* element = current->GetElement()) out.insert(element);
    return NetListWalk::Step::kDescend;
  });
}

void CUnitTree::CollectTreeFiles(IHdlNetListNode* node, FileSet& out) {
  NetListWalk::WalkPreOrder(node, [&](IHdlNetListNode* current) {
    // The project holds its files, so the set may borrow them.
    if (Prjrep::AutoPtr<IHdlFile> file = NetListWalk::SourceFileOf(current)) out.insert(file.Get());
    return NetListWalk::Step::kDescend;
  });
}

}  // namespace Vad
