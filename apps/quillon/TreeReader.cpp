#include "TreeReader.h"

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

// A design-unit key starts with the unit's type name: "Architecture|cpu|rtl".
std::optional<std::string> ElementTypeOf(Vad::IHdlElement* element) {
  if (!element) return std::nullopt;
  std::string key = TextOf(Prjrep::QueryAs<Prjrep::IName>(element), &Prjrep::IName::GetName);
  return key.substr(0, key.find('|'));
}

std::optional<std::string> ElementFileOf(Vad::IHdlElement* element) {
  Prjrep::AutoRelease<Vad::IHdlFile> file;
  if (!element || element->GetFile(file.Out()) != CitI::kOk || !file) return std::nullopt;
  return FileFacts::PathOf(file.Get());
}

void DescribeChildren(Vad::IHdlNetListNode* node, std::vector<TreeNodeInfo>& children) {
  Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> iterator;
  if (node->GetChildren(iterator.Out()) != CitI::kOk || !iterator) return;
  for (iterator->First(); !iterator->IsDone(); iterator->Next()) {
    if (Vad::IHdlNetListNode* child = iterator->Current()) children.push_back(TreeReader::Describe(child));
  }
}

}  // namespace

TreeNodeInfo TreeReader::Describe(Vad::IHdlNetListNode* node) {
  TreeNodeInfo info;
  auto* internal = Prjrep::QueryAs<Vad::IHdlNetListNodeInternal>(node);
  auto* tcl = Prjrep::QueryAs<UtilI::ITclCollectable>(node);
  info.name = TextOf(internal, &Vad::IHdlNetListNodeInternal::GetName);
  info.kind = TextOf(internal, &Vad::IHdlNetListNodeInternal::GetKind);
  info.unit = TextOf(node, &Vad::IHdlNetListNode::GetUnitName);
  info.architecture = TextOf(node, &Vad::IHdlNetListNode::GetArchitectureName);
  info.instance = TextOf(node, &Vad::IHdlNetListNode::GetInstanceName);
  info.path = TextOf(tcl, &UtilI::ITclCollectable::GetName);
  info.type = TextOf(tcl, &UtilI::ITclCollectable::GetType);
  info.libraryCell = node->IsLibraryCell();
  info.partition =
      TextOf(Prjrep::QueryAs<Vad::IHdlPartitionData>(node), &Vad::IHdlPartitionData::GetPartition);
  Vad::IHdlElement* element = node->GetElement();
  info.elementType = ElementTypeOf(element);
  info.file = ElementFileOf(element);
  DescribeChildren(node, info.children);
  return info;
}

CitI::Result TreeReader::Read(Vad::IHdlProject* project, TreeNodeInfo& root) {
  auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(project);
  if (!elaboration) return CitI::kFail;
  Prjrep::AutoRelease<Vad::IHdlNetListNode> node;
  CitI::Result result = elaboration->getHierarchyRoot(node.Out());
  if (result != CitI::kOk) return result;
  if (!node) return CitI::kFail;
  root = Describe(node.Get());
  return CitI::kOk;
}

}  // namespace quillon
