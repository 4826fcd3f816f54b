#include "CNetListNode.h"

#include <algorithm>
#include <cstdio>

#include "IHdlDUProperties.h"
#include "IHdlFile.h"
#include "Identifiers.h"
#include "Port/InitObjects.h"

namespace Vad {
namespace {

constexpr const char* kPartitionProperty = "PARTITION";
constexpr const char* kAssocModulePlugin = "PLUGIN_AssocModule";
constexpr const char* kInstanceType = "instance";

CitI::Result CopyText(const Port::StringBase& text, Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  *out = text;
  return CitI::kOk;
}

}  // namespace

// ---- the node lists ------------------------------------------------------------------------------

template <bool kHoldsReferences>
CitI::Result TNetListNodeList<kHoldsReferences>::Insert(std::size_t index, IHdlNetListNode* node) {
  if (!node) return CitI::kInvalidArg;
  const auto offset = static_cast<std::ptrdiff_t>(std::min(index, nodes_.size()));
  if constexpr (kHoldsReferences)
    references_.insert(references_.begin() + offset, Prjrep::AutoPtr<IHdlNetListNode>(node));
  nodes_.insert(nodes_.begin() + offset, node);
  return CitI::kOk;
}

template <bool kHoldsReferences>
CitI::Result TNetListNodeList<kHoldsReferences>::Remove(IHdlNetListNodeIterator* position) {
  auto* own = Prjrep::OwnIterator(this, position);
  if (!own) return CitI::kFail;
  const auto offset = static_cast<std::ptrdiff_t>(own->position());
  nodes_.erase(nodes_.begin() + offset);
  if constexpr (kHoldsReferences) {
    // Released after the entry is gone, as the node may take the list's owner with it.
    Prjrep::AutoPtr<IHdlNetListNode> released = std::move(references_[offset]);
    references_.erase(references_.begin() + offset);
  }
  return CitI::kOk;
}

template <bool kHoldsReferences>
CitI::Result TNetListNodeList<kHoldsReferences>::Clear() {
  nodes_.clear();
  // Released after the list is empty, in list order.
  std::vector<Prjrep::AutoPtr<IHdlNetListNode>> released;
  released.swap(references_);
  return CitI::kOk;
}

template <bool kHoldsReferences>
IHdlNetListNode* TNetListNodeList<kHoldsReferences>::ElementAt(IHdlNetListNodeIterator* position) {
  auto* own = Prjrep::OwnIterator(this, position);
  return own ? At(own->position()) : nullptr;
}

template <bool kHoldsReferences>
void TNetListNodeList<kHoldsReferences>::Forget(IHdlNetListNode* node) {
  std::erase(nodes_, node);
}

template class TNetListNodeList<true>;
template class TNetListNodeList<false>;

// ---- the node ------------------------------------------------------------------------------------

CNetListNode::CNetListNode() {
  children_.SetOwner(this);
  parents_.SetOwner(this);
}

CNetListNode::~CNetListNode() {
  // Children that outlive this node must not keep a link to it.
  for (IHdlNetListNode* child : children_.Nodes()) {
    if (CNetListNode* node = FromInterface(child)) node->parents_.Forget(&nodeFace_);
  }
  children_.Clear();
}

CitI::IInterface* CNetListNode::QueryInterface(const Port::XUID& id) {
  if (id == IHdlNetListNode::Iid()) return &nodeFace_;
  if (id == Prjrep::IRefCount::Iid() || id == Prjrep::IRefCountV1::Iid()) return &refs_;
  if (id == IHdlPartitionData::Iid()) return &partitionFace_;
  if (id == UtilI::ITclCollectable::Iid()) return &tclFace_;
  if (id == IHdlNetListNodeInternal::Iid()) return &internalFace_;
  if (id == IInstanceData::Iid()) return &instanceDataFace_;
  if (id == InterfaceIds::ImplementationIdentity()) return &nodeFace_;
  if (id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CNetListNode* CNetListNode::FromInterface(CitI::IInterface* object) {
  auto* face = dynamic_cast<XIHdlNetListNode*>(Prjrep::QueryAs<IHdlNetListNode>(object));
  return face ? face->Node() : nullptr;
}

CitI::Result CNetListNode::LinkChild(IHdlNetListNode* child, bool atFront) {
  if (!child) return CitI::kInvalidArg;
  auto* childInternal = Prjrep::QueryAs<IHdlNetListNodeInternal>(child);
  if (!childInternal) return CitI::kInvalidArg;
  CitI::Result result = atFront ? children_.AddFront(child) : children_.Add(child);
  if (result != CitI::kOk) return result;
  return childInternal->AddParent(&nodeFace_);
}

CitI::Result CNetListNode::AddChildFirst(IHdlNetListNode* child) { return LinkChild(child, true); }

CitI::Result CNetListNode::AddChild(IHdlNetListNode* child) { return LinkChild(child, false); }

CitI::Result CNetListNode::AddParent(IHdlNetListNode* parent) { return parents_.Add(parent); }

bool CNetListNode::ElementUsesPlugin(const char* pluginName) const {
  if (!element_) return false;
  Prjrep::AutoRelease<IHdlFile> file;
  if (element_->GetFile(file.Out()) != CitI::kOk || !file) return false;
  Port::StringBase plugin;
  file->getPluginName(&plugin);
  return plugin == pluginName;
}

void CNetListNode::ComputePaths(const Port::StringBase& parentPath) {
  if (!instanceName_.IsEmpty()) {
    path_.Format("%s/%s", parentPath.c_str(), instanceName_.c_str());
    type_ = kInstanceType;
  } else if (kind_ == "Architecture") {
    path_.Format("/%s", unitName_.c_str());
    type_ = kInstanceType;
  } else if (kind_ == "Module") {
    path_.Format("/%s", unitName_.c_str());
    type_ = ElementUsesPlugin(kAssocModulePlugin) ? kind_ : Port::StringBase(kInstanceType);
  } else {
    path_.Empty();
    type_ = kind_;
  }
  for (IHdlNetListNode* child : children_.Nodes()) {
    if (auto* internal = Prjrep::QueryAs<IHdlNetListNodeInternal>(child)) internal->ComputePaths(path_);
  }
}

CitI::Result CNetListNode::GetPartition(Port::StringBase& out) const {
  out.Empty();
  IHdlElement* source = instanceElement_ ? instanceElement_.Get() : element_.Get();
  auto* properties = Prjrep::QueryAs<IHdlDUProperties>(source);
  if (!properties) return CitI::kFail;
  properties->GetProperty(kPartitionProperty, &out);
  return CitI::kOk;
}

bool CNetListNode::IsPartition() const {
  Port::StringBase partition;
  return GetPartition(partition) == CitI::kOk && !partition.IsEmpty();
}

CitI::Result CNetListNode::QueryInstanceData(bool* out) const {
  if (out) *out = false;
  auto* instanceData = Prjrep::QueryAs<IInstanceData>(instanceElement_.Get());
  if (!instanceData) return CitI::kFail;
  instanceData->GetInGenerate(out);
  return CitI::kOk;
}

void CNetListNode::Print() const {
  std::printf("CNetListNode::ITclCollectable -> Name = %s Type = %s\n", path_.c_str(), type_.c_str());
}

// ---- IHdlNetListNode -----------------------------------------------------------------------------

CitI::Result CNetListNode::XIHdlNetListNode::GetChildren(IHdlNetListNodeIterator** out) {
  return owner()->children_.CreateIterator(out);
}

CitI::Result CNetListNode::XIHdlNetListNode::GetParents(IHdlNetListNodeIterator** out) {
  return owner()->parents_.CreateIterator(out);
}

CitI::Result CNetListNode::XIHdlNetListNode::GetInstanceName(Port::StringBase* out) {
  return CopyText(owner()->instanceName_, out);
}

CitI::Result CNetListNode::XIHdlNetListNode::GetUnitName(Port::StringBase* out) {
  return CopyText(owner()->unitName_, out);
}

CitI::Result CNetListNode::XIHdlNetListNode::GetArchitectureName(Port::StringBase* out) {
  return CopyText(owner()->architectureName_, out);
}

// ---- IHdlNetListNodeInternal ---------------------------------------------------------------------

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetElement(IHdlElement* element) {
  owner()->SetElement(element);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetInstanceElement(IHdlElement* element) {
  owner()->SetInstanceElement(element);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetName(const Port::StringBase& name) {
  owner()->SetName(name);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::GetName(Port::StringBase* out) {
  return CopyText(owner()->name_, out);
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::GetKind(Port::StringBase* out) {
  return CopyText(owner()->kind_, out);
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetInstanceName(const Port::StringBase& label) {
  owner()->SetInstanceName(label);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetLibraryCell(bool isLibraryCell) {
  owner()->SetLibraryCell(isLibraryCell);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetKind(const Port::StringBase& kind) {
  owner()->SetKind(kind);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetArchitectureName(const Port::StringBase& name) {
  owner()->SetArchitectureName(name);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::SetUnitName(const Port::StringBase& name) {
  owner()->SetUnitName(name);
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlNetListNodeInternal::ComputePaths(const Port::StringBase& parentPath) {
  owner()->ComputePaths(parentPath);
  return CitI::kOk;
}

// ---- IHdlPartitionData ---------------------------------------------------------------------------

CitI::Result CNetListNode::XIHdlPartitionData::IsPartition(bool* out) {
  if (!out) return CitI::kInvalidArg;
  *out = owner()->IsPartition();
  return CitI::kOk;
}

CitI::Result CNetListNode::XIHdlPartitionData::GetPartition(Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  return owner()->GetPartition(*out);
}

// ---- IInstanceData -------------------------------------------------------------------------------

CitI::Result CNetListNode::XIInstanceData::GetInGenerate(bool* out) {
  return owner()->QueryInstanceData(out);
}

// ---- UtilI::ITclCollectable ----------------------------------------------------------------------

CitI::Result CNetListNode::XITclCollectable::GetName(Port::StringBase* out) {
  return CopyText(owner()->path_, out);
}

CitI::Result CNetListNode::XITclCollectable::GetType(Port::StringBase* out) {
  return CopyText(owner()->type_, out);
}

CitI::Result CNetListNode::XITclCollectable::GetCollectionId(Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  out->Format("netlistnode:%s", owner()->path_.c_str());
  return CitI::kOk;
}

CitI::Result CNetListNode::XITclCollectable::Print() {
  owner()->Print();
  return CitI::kOk;
}

}  // namespace Vad
