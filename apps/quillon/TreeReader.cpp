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

std::vector<Vad::IHdlNetListNode*> ChildrenOf(Vad::IHdlNetListNode* node) {
  std::vector<Vad::IHdlNetListNode*> children;
  Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> iterator;
  if (node->GetChildren(iterator.Out()) != CitI::kOk || !iterator) return children;
  for (iterator->First(); !iterator->IsDone(); iterator->Next()) {
    if (Vad::IHdlNetListNode* child = iterator->Current()) children.push_back(child);
  }
  return children;
}

// Describes nodes; the path and library of each file are read once, as many nodes share a file.
class NodeReader {
 public:
  explicit NodeReader(TreeReader::Detail detail) : detail_(detail) {}

  void Describe(Vad::IHdlNetListNode* node, TreeNodeInfo& info) {
    if (detail_ != TreeReader::Detail::kLinks) DescribeLabels(node, info);
    info.unit = TextOf(node, &Vad::IHdlNetListNode::GetUnitName);
    info.libraryCell = node->IsLibraryCell();
    Vad::IHdlElement* element = node->GetElement();
    info.elementKey = ElementKeyOf(element);
    info.elementType = TypeOfKey(info.elementKey);
    DescribeFileOf(element, info);
  }

 private:
  struct FileFactsOf {
    std::string path;
    std::string library;
  };

  void DescribeLabels(Vad::IHdlNetListNode* node, TreeNodeInfo& info) const {
    auto* internal = Prjrep::QueryAs<Vad::IHdlNetListNodeInternal>(node);
    auto* tcl = Prjrep::QueryAs<UtilI::ITclCollectable>(node);
    info.name = TextOf(internal, &Vad::IHdlNetListNodeInternal::GetName);
    info.kind = TextOf(internal, &Vad::IHdlNetListNodeInternal::GetKind);
    info.architecture = TextOf(node, &Vad::IHdlNetListNode::GetArchitectureName);
    info.instance = TextOf(node, &Vad::IHdlNetListNode::GetInstanceName);
    if (detail_ == TreeReader::Detail::kLabelsAndPaths)
      info.path = TextOf(tcl, &UtilI::ITclCollectable::GetName);
    info.type = TextOf(tcl, &UtilI::ITclCollectable::GetType);
    info.partition =
        TextOf(Prjrep::QueryAs<Vad::IHdlPartitionData>(node), &Vad::IHdlPartitionData::GetPartition);
  }

  // The path and library of the element's file; both unset when it has none.
  void DescribeFileOf(Vad::IHdlElement* element, TreeNodeInfo& info) {
    Prjrep::AutoRelease<Vad::IHdlFile> file;
    if (!element || element->GetFile(file.Out()) != CitI::kOk || !file) return;
    auto [facts, added] = files_.try_emplace(file.Get());
    if (added) facts->second = {FileFacts::PathOf(file.Get()), FileFacts::LibraryOf(file.Get())};
    info.file = facts->second.path;
    info.library = facts->second.library;
  }

  TreeReader::Detail detail_;
  // The project holds its files while the tree is read.
  std::unordered_map<Vad::IHdlFile*, FileFactsOf> files_;
};

}  // namespace

// The shape first (which node goes where), then every node described in its place: the
// descriptions are large, and growing a list of them moved each one again and again.
TreeInfo TreeReader::ReadTree(Vad::IHdlNetListNode* root, Detail detail) {
  struct Placed {
    Vad::IHdlNetListNode* node;
    std::size_t parent;
    std::size_t position;
    std::size_t children = 0;
    std::optional<std::size_t> sharedWith = std::nullopt;
  };
  std::vector<Placed> placed;
  // Where each node was met first; only nodes with several parents are met again.
  std::unordered_map<Vad::IHdlNetListNode*, std::size_t> first;
  std::vector<Placed> pending{{root, 0, 0}};
  while (!pending.empty()) {
    placed.push_back(pending.back());
    pending.pop_back();
    Placed& next = placed.back();
    auto [seen, isFirst] = first.try_emplace(next.node, placed.size() - 1);
    if (!isFirst) {
      next.sharedWith = seen->second;
      continue;
    }
    std::vector<Vad::IHdlNetListNode*> children = ChildrenOf(next.node);
    next.children = children.size();
    for (std::size_t i = children.size(); i-- > 0;) pending.push_back({children[i], placed.size() - 1, i});
  }

  TreeInfo tree;
  tree.nodes.resize(placed.size());
  NodeReader reader(detail);
  for (std::size_t index = 0; index < placed.size(); ++index) {
    const Placed& shape = placed[index];
    TreeNodeInfo& info = tree.nodes[index];
    reader.Describe(shape.node, info);
    info.parent = shape.parent;
    info.position = shape.position;
    info.sharedWith = shape.sharedWith;
    info.children.resize(shape.children);
    if (index > 0) tree.nodes[shape.parent].children[shape.position] = index;
  }
  return tree;
}

CitI::Result TreeReader::Read(Vad::IHdlProject* project, TreeInfo& tree, bool withPaths) {
  return ReadRoot(project, tree, withPaths ? Detail::kLabelsAndPaths : Detail::kLabels);
}

CitI::Result TreeReader::ReadLinks(Vad::IHdlProject* project, TreeInfo& tree) {
  return ReadRoot(project, tree, Detail::kLinks);
}

CitI::Result TreeReader::ReadRoot(Vad::IHdlProject* project, TreeInfo& tree, Detail detail) {
  auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(project);
  if (!elaboration) return CitI::kFail;
  Prjrep::AutoRelease<Vad::IHdlNetListNode> node;
  CitI::Result result = elaboration->getHierarchyRoot(node.Out());
  if (result != CitI::kOk) return result;
  if (!node) return CitI::kFail;
  tree = ReadTree(node.Get(), detail);
  return CitI::kOk;
}

}  // namespace quillon
