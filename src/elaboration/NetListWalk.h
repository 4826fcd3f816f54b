// Walks over hierarchy trees through the node interface, shared by the compile order and the
// reduced unit trees. Trees can be deep, so no walk recurses; a subtree that several parents
// share is walked once.
#pragma once

#include <unordered_set>
#include <vector>

#include "CNetListNode.h"
#include "CitI.h"
#include "IHdlElement.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "Prjrep/AutoPtr.h"

namespace Vad::NetListWalk {

// The object itself behind any of its interfaces, so that an element seen through IHdlElement
// and a unit seen through IHdlDesignUnit compare equal; null for null.
inline CitI::IInterface* Identity(CitI::IInterface* object) {
  return object ? object->QueryInterface(CitI::IInterface::Iid()) : nullptr;
}

// The children of `node` in child order (borrowed; the node holds them).
inline std::vector<IHdlNetListNode*> ChildrenOf(IHdlNetListNode* node) {
  std::vector<IHdlNetListNode*> children;
  Prjrep::AutoRelease<IHdlNetListNodeIterator> child;
  if (!node || node->GetChildren(child.Out()) != CitI::kOk || !child) return children;
  for (; !child->IsDone(); child->Next()) {
    if (IHdlNetListNode* current = child->Current()) children.push_back(current);
  }
  return children;
}

// The source file of the node's element, or null when the node has no element or the element
// no file.
inline Prjrep::AutoPtr<IHdlFile> SourceFileOf(IHdlNetListNode* node) {
  Prjrep::AutoPtr<IHdlFile> file;
  IHdlElement* element = node ? node->GetElement() : nullptr;
  if (element) element->GetSourceFile(file.Out());
  return file;
}

enum class Step { kDescend, kSkipChildren, kStop };

// Whether several parents hold `node`, so that a walk can meet it more than once.
inline bool IsShared(IHdlNetListNode* node) {
  CNetListNode* object = CNetListNode::FromInterface(node);
  return object && object->HasSeveralParents();
}

// Visits `start` and the nodes below it in pre-order (a node, then its children's subtrees in
// child order); a node with several parents only where it is met first. `visit` returns how the
// walk goes on after the node.
template <class Visit>
void WalkPreOrder(IHdlNetListNode* start, Visit visit) {
  std::vector<IHdlNetListNode*> pending;
  // Shared nodes met so far; the start counts too, so that a loop a host made also ends.
  std::unordered_set<IHdlNetListNode*> met;
  if (start) pending.push_back(start);
  while (!pending.empty()) {
    IHdlNetListNode* node = pending.back();
    pending.pop_back();
    if ((node == start || IsShared(node)) && !met.insert(node).second) continue;
    Step step = visit(node);
    if (step == Step::kStop) return;
    if (step == Step::kSkipChildren) continue;
    std::vector<IHdlNetListNode*> children = ChildrenOf(node);
    pending.insert(pending.end(), children.rbegin(), children.rend());
  }
}

// The first node, in pre-order from `start`, whose element is `unit` (compared as objects), or
// null.
inline IHdlNetListNode* FindNodeOfUnit(IHdlNetListNode* start, CitI::IInterface* unit) {
  CitI::IInterface* wanted = Identity(unit);
  IHdlNetListNode* found = nullptr;
  if (!wanted) return found;
  WalkPreOrder(start, [&](IHdlNetListNode* node) {
    if (Identity(node->GetElement()) != wanted) return Step::kDescend;
    found = node;
    return Step::kStop;
  });
  return found;
}

}  // namespace Vad::NetListWalk
