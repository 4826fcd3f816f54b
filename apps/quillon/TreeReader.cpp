#include "TreeReader.h"

#include <unordered_map>
#include <utility>
#include <vector>

#include "FileFacts.h"
#include "IHdlElaborationData.h"
#include "IHdlElement.h"
#include "IHdlNetListNode.h"
#include "IName.h"
#include "ITclCollectable.h"
#include "Prjrep/AutoPtr.h"

namespace quillon {

namespace {

template <class Interface, class Getter>
std::string TextOf(Interface* object, Getter getter) {
  Port::StringBase text;
  if (object) (object->*getter)(&text);
  return text.str();
}

std::optional<std::string> ElementKeyOf(Vad::IHdlElement* element) {
  if (!element) return std::nullopt;
  return TextOf(Prjrep::QueryAs<Prjrep::IName>(element), &Prjrep::IName::GetName);
}

// A design-unit key starts with the unit's type name: "Architecture|cpu|rtl".
std::optional<std::string> TypeOfKey(const std::optional<std::string>& key) {
  if (!key) return std::nullopt;
  return key->substr(0, key->find('|'));
}

// The path and library of the element's file; both unset when it has none.
void DescribeFileOf(Vad::IHdlElement* element, TreeNodeInfo& info) {
  Prjrep::AutoRelease<Vad::IHdlFile> file;
  if (!element || element->GetFile(file.Out()) != CitI::kOk || !file) return;
  info.file = FileFacts::PathOf(file.Get());
  info.library = FileFacts::LibraryOf(file.Get());
}

std::vector<Vad::IHdlNetListNode*> ChildrenOf(Vad::IHdlNetListNode* node) {
  std::vector<Vad::IHdlNetListNode*> children;
  Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> iterator;
  if (node->GetChildren(iterator.Out()) != CitI::kOk || !iterator) return children;
  for (iterator->First(); !iterator->IsDone(); iterator->Next()) {
    if (Vad::IHdlNetListNode* child = iterator->Current()) children.push_back(child);
  }
  return children;
}

}  // namespace

TreeNodeInfo TreeReader::Describe(Vad::IHdlNetListNode* node, bool withPaths) {
  TreeNodeInfo info;
  auto* internal = Prjrep::QueryAs<Vad::IHdlNetListNodeInternal>(node);
  auto* tcl = Prjrep::QueryAs<UtilI::ITclCollectable>(node);
  info.name = TextOf(internal, &Vad::IHdlNetListNodeInternal::GetName);
  info.kind = TextOf(internal, &Vad::IHdlNetListNodeInternal::GetKind);
  info.unit = TextOf(node, &Vad::IHdlNetListNode::GetUnitName);
  info.architecture = TextOf(node, &Vad::IHdlNetListNode::GetArchitectureName);
  info.instance = TextOf(node, &Vad::IHdlNetListNode::GetInstanceName);
  if (withPaths) info.path = TextOf(tcl, &UtilI::ITclCollectable::GetName);
  info.type = TextOf(tcl, &UtilI::ITclCollectable::GetType);
  info.libraryCell = node->IsLibraryCell();
  info.partition =
      TextOf(Prjrep::QueryAs<Vad::IHdlPartitionData>(node), &Vad::IHdlPartitionData::GetPartition);
  Vad::IHdlElement* element = node->GetElement();
  info.elementKey = ElementKeyOf(element);
  info.elementType = TypeOfKey(info.elementKey);
  DescribeFileOf(element, info);
  return info;
}

TreeInfo TreeReader::ReadTree(Vad::IHdlNetListNode* root, bool withPaths) {
  struct Pending {
    Vad::IHdlNetListNode* node;
    std::size_t parent;
    std::size_t position;
  };
  TreeInfo tree;
  // Where each node was met first; only nodes with several parents are met again.
  std::unordered_map<Vad::IHdlNetListNode*, std::size_t> first;
  std::vector<Pending> pending{{root, 0, 0}};
  while (!pending.empty()) {
    Pending next = pending.back();
    pending.pop_back();
    std::size_t index = tree.nodes.size();
    tree.nodes.push_back(Describe(next.node, withPaths));
    TreeNodeInfo& info = tree.nodes.back();
    info.parent = next.parent;
    info.position = next.position;
    if (index > 0) tree.nodes[next.parent].children[next.position] = index;
    auto [seen, isFirst] = first.try_emplace(next.node, index);
    if (!isFirst) {
      info.sharedWith = seen->second;
      continue;
    }
    std::vector<Vad::IHdlNetListNode*> children = ChildrenOf(next.node);
    info.children.resize(children.size());
    for (std::size_t i = children.size(); i-- > 0;) pending.push_back({children[i], index, i});
  }
  return tree;
}

CitI::Result TreeReader::Read(Vad::IHdlProject* project, TreeInfo& tree, bool withPaths) {
  auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(project);
  if (!elaboration) return CitI::kFail;
  Prjrep::AutoRelease<Vad::IHdlNetListNode> node;
  CitI::Result result = elaboration->getHierarchyRoot(node.Out());
  if (result != CitI::kOk) return result;
  if (!node) return CitI::kFail;
  tree = ReadTree(node.Get(), withPaths);
  return CitI::kOk;
}

}  // namespace quillon
