#include "CNetListNode.h"

#include <algorithm>
#include <cstdio>
#include <unordered_set>
#include <utility>

#include "IHdlDUProperties.h"
#include "IHdlFile.h"
#include "Identifiers.h"
#include "Port/InitObjects.h"
#include "Prjrep/RefCounting.h"

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

// Releases `nodes`. A node that dies meanwhile hands its children to the same loop instead of
// releasing them from its destructor, so that a deep tree is freed without deep recursion.
void ReleaseWithoutRecursion(std::vector<IHdlNetListNode*> nodes) {
  static thread_local std::vector<IHdlNetListNode*>* pending = nullptr;
  if (pending) {
    pending->insert(pending->end(), nodes.begin(), nodes.end());
    return;
  }
  pending = &nodes;
  while (!nodes.empty()) {
    IHdlNetListNode* node = nodes.back();
    nodes.pop_back();
    Prjrep::ReleaseOf(node);
  }
  pending = nullptr;
}

}  // namespace

// ---- the node lists ------------------------------------------------------------------------------

template <bool kHoldsReferences>
CitI::Result TNetListNodeList<kHoldsReferences>::Insert(std::size_t index, IHdlNetListNode* node) {
  if (!node) return CitI::kInvalidArg;
  if constexpr (kHoldsReferences) Prjrep::AddRefOf(node);
  nodes_.insert(nodes_.begin() + static_cast<std::ptrdiff_t>(std::min(index, nodes_.size())), node);
  return CitI::kOk;
}

template <bool kHoldsReferences>
CitI::Result TNetListNodeList<kHoldsReferences>::Remove(IHdlNetListNodeIterator* position) {
  auto* own = Prjrep::OwnIterator(this, position);
  if (!own) return CitI::kFail;
  IHdlNetListNode* node = nodes_[own->position()];
  nodes_.erase(nodes_.begin() + static_cast<std::ptrdiff_t>(own->position()));
  if (!node) --holes_;
  if constexpr (kHoldsReferences) {
    if (node) Prjrep::ReleaseOf(node);
  }
  return CitI::kOk;
}

template <bool kHoldsReferences>
std::vector<IHdlNetListNode*> TNetListNodeList<kHoldsReferences>::Detach() {
  std::vector<IHdlNetListNode*> detached;
  detached.swap(nodes_);
  std::erase(detached, nullptr);
  holes_ = 0;
  return detached;
}

template <bool kHoldsReferences>
CitI::Result TNetListNodeList<kHoldsReferences>::Clear() {
  std::vector<IHdlNetListNode*> released = Detach();
  if constexpr (kHoldsReferences) ReleaseWithoutRecursion(std::move(released));
  return CitI::kOk;
}

template <bool kHoldsReferences>
IHdlNetListNode* TNetListNodeList<kHoldsReferences>::ElementAt(IHdlNetListNodeIterator* position) {
  auto* own = Prjrep::OwnIterator(this, position);
  return own ? At(own->position()) : nullptr;
}

template <bool kHoldsReferences>
void TNetListNodeList<kHoldsReferences>::Forget(IHdlNetListNode* node) {
  if (node) std::erase(nodes_, node);
}

template <bool kHoldsReferences>
bool TNetListNodeList<kHoldsReferences>::ForgetAt(std::size_t index, IHdlNetListNode* node) {
  // A blanked entry of a list that holds references would keep its reference.
  if (kHoldsReferences || !node || index >= nodes_.size() || nodes_[index] != node) return false;
  nodes_[index] = nullptr;
  ++holes_;
  return true;
}

template class TNetListNodeList<true>;
template class TNetListNodeList<false>;

// ---- path texts ----------------------------------------------------------------------------------

CNetListNode::PathPiece::~PathPiece() {
  std::shared_ptr<const PathPiece> next = std::move(prefix);
  // Only this piece held `next`: take its prefix before it goes, so each piece dies alone.
  while (next && next.use_count() == 1) next = std::move(next->prefix);
}

// ---- the node ------------------------------------------------------------------------------------

CNetListNode::CNetListNode() {
  children_.SetOwner(this);
  parents_.SetOwner(this);
}

CNetListNode::~CNetListNode() {
  // Children that outlive this node must not keep a link to it.
  const std::vector<IHdlNetListNode*>& children = children_.Nodes();
  bool slotsKnown = parentSlots_.size() == children.size();
  for (std::size_t i = 0; i < children.size(); ++i) {
    CNetListNode* node = FromInterface(children[i]);
    if (!node) continue;
    if (!slotsKnown || !node->parents_.ForgetAt(parentSlots_[i], &nodeFace_))
      node->parents_.Forget(&nodeFace_);
  }
  ReleaseWithoutRecursion(children_.Detach());
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
  result = childInternal->AddParent(&nodeFace_);
  CNetListNode* childNode = FromInterface(child);
  std::size_t slot = childNode ? childNode->parents_.Nodes().size() - 1 : 0;
  parentSlots_.insert(atFront ? parentSlots_.begin() : parentSlots_.end(), slot);
  return result;
}

IHdlNetListNode* CNetListNode::FirstParent() const {
  for (IHdlNetListNode* parent : parents_.Nodes()) {
    if (parent) return parent;
  }
  return nullptr;
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

void CNetListNode::SetPathBelow(const PathText& parentPath) {
  auto own = [](const char* format, const Port::StringBase& text) {
    Port::StringBase piece;
    piece.Format(format, text.c_str());
    return std::make_shared<const PathPiece>(nullptr, std::move(piece));
  };
  if (!instanceName_.IsEmpty()) {
    Port::StringBase piece;
    piece.Format("/%s", instanceName_.c_str());
    path_ = std::make_shared<const PathPiece>(parentPath, std::move(piece));
    type_ = kInstanceType;
  } else if (kind_ == "Architecture") {
    path_ = own("/%s", unitName_);
    type_ = kInstanceType;
  } else if (kind_ == "Module") {
    path_ = own("/%s", unitName_);
    type_ = ElementUsesPlugin(kAssocModulePlugin) ? kind_ : Port::StringBase(kInstanceType);
  } else {
    path_.reset();
    type_ = kind_;
  }
}

void CNetListNode::ComputePaths(const Port::StringBase& parentPath) {
  PathText start = parentPath.IsEmpty() ? nullptr : std::make_shared<const PathPiece>(nullptr, parentPath);
  // A node with several parents (a shared subtree, or a loop a host made) is done once: nodes
  // without an instance label have the same path under every parent.
  std::unordered_set<const CNetListNode*> done{this};
  std::vector<std::pair<CNetListNode*, PathText>> pending{{this, std::move(start)}};
  while (!pending.empty()) {
    auto [node, below] = std::move(pending.back());
    pending.pop_back();
    node->SetPathBelow(below);
    const std::vector<IHdlNetListNode*>& children = node->children_.Nodes();
    for (auto child = children.rbegin(); child != children.rend(); ++child) {
      CNetListNode* childNode = FromInterface(*child);
      if (!childNode) continue;
      if (childNode->HasSeveralParents() && !done.insert(childNode).second) continue;
      pending.emplace_back(childNode, node->path_);
    }
  }
}

Port::StringBase CNetListNode::Path() const {
  std::vector<const Port::StringBase*> pieces;
  for (const PathPiece* piece = path_.get(); piece; piece = piece->prefix.get())
    pieces.push_back(&piece->text);
  Port::StringBase path;
  for (auto piece = pieces.rbegin(); piece != pieces.rend(); ++piece) path.Append((*piece)->view());
  return path;
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
  std::printf("CNetListNode::ITclCollectable -> Name = %s Type = %s\n", Path().c_str(), type_.c_str());
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
  return CopyText(owner()->Path(), out);
}

CitI::Result CNetListNode::XITclCollectable::GetType(Port::StringBase* out) {
  return CopyText(owner()->type_, out);
}

CitI::Result CNetListNode::XITclCollectable::GetCollectionId(Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  out->Format("netlistnode:%s", owner()->Path().c_str());
  return CitI::kOk;
}

CitI::Result CNetListNode::XITclCollectable::Print() {
  owner()->Print();
  return CitI::kOk;
}

}  // namespace Vad
