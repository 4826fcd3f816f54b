// One node of the instance hierarchy: a design unit (or a unit that is not in the project) in the
// place where an instance, a use clause or a primary-unit link put it, with its children.
#pragma once

#include <cstddef>
#include <memory>
#include <vector>

#include "CitI.h"
#include "IHdlElement.h"
#include "IHdlNetListNode.h"
#include "IInstanceData.h"
#include "ITclCollectable.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TRefCountHelper.h"
#include "Prjrep/TSetHelper.h"

namespace Vad {

// A list of nodes in insertion order behind the node-set interface. The child list holds one
// reference on each node; the parent list holds none, so that parent links keep nothing alive.
// Embedded in a node, which is its owner: iterators over it keep the node alive. An entry that
// ForgetAt blanks stays as a null hole that counting and iterating pass over, so that a node
// shared by many parents loses each dying parent in constant time.
template <bool kHoldsReferences>
class TNetListNodeList : public Prjrep::TSetHelper<IHdlNetListNodeSet> {
 public:
  using Position = std::size_t;

  TNetListNodeList() = default;
  ~TNetListNodeList() override { Clear(); }

  CitI::Result Add(IHdlNetListNode* node) override { return Insert(nodes_.size(), node); }
  // Puts `node` in front of the others.
  CitI::Result AddFront(IHdlNetListNode* node) { return Insert(0, node); }
  CitI::Result Remove(IHdlNetListNodeIterator* position) override;
  CitI::Result CreateIterator(IHdlNetListNodeIterator** out) override {
    return Prjrep::CreateSetIterator(this, out);
  }
  std::uint32_t GetCount() override { return static_cast<std::uint32_t>(LiveCount()); }
  std::size_t LiveCount() const { return nodes_.size() - holes_; }
  CitI::Result Clear() override;
  CitI::Result EraseAt(IHdlNetListNodeIterator* position) override { return Remove(position); }
  IHdlNetListNode* ElementAt(IHdlNetListNodeIterator* position) override;

  // The entries, with null holes where ForgetAt blanked one.
  const std::vector<IHdlNetListNode*>& Nodes() const { return nodes_; }
  // Hands the entries over without touching their counts and empties the list.
  std::vector<IHdlNetListNode*> Detach();
  // Drops every entry of `node` without touching its count (for links that hold none).
  void Forget(IHdlNetListNode* node);
  // Blanks the entry at `index` when it holds `node` (for links that hold none); false otherwise.
  bool ForgetAt(std::size_t index, IHdlNetListNode* node);

  // Positions, for the iterator helper.
  Position Begin() const { return SkipHoles(0); }
  bool AtEnd(const Position& position) const { return position >= nodes_.size(); }
  void Advance(Position& position) const { position = SkipHoles(position + 1); }
  IHdlNetListNode* At(const Position& position) const {
    return position < nodes_.size() ? nodes_[position] : nullptr;
  }

 private:
  CitI::Result Insert(std::size_t index, IHdlNetListNode* node);
  Position SkipHoles(Position position) const {
    while (position < nodes_.size() && !nodes_[position]) ++position;
    return position;
  }

  std::vector<IHdlNetListNode*> nodes_;
  std::size_t holes_ = 0;
};

extern template class TNetListNodeList<true>;
extern template class TNetListNodeList<false>;

using XtHdlNetListNodeSetHelperChild = TNetListNodeList<true>;
using XtHdlNetListNodeSetHelperParent = TNetListNodeList<false>;

// Created through the registry (ClassIds::CNetListNode) with count 1. QueryInterface answers, in
// this order, IHdlNetListNode, Prjrep::IRefCount, IHdlPartitionData, UtilI::ITclCollectable,
// IHdlNetListNodeInternal, IInstanceData, the implementation identity (with the IHdlNetListNode
// face) and IInterface (the object itself, so that the factory can hand it out).
class CNetListNode final : public CitI::IInterface {
 public:
  CNetListNode();
  // Public for the class factory; the object is otherwise ended by its reference count.
  ~CNetListNode() override;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // The node object behind any of its faces, or null for anything else.
  static CNetListNode* FromInterface(CitI::IInterface* object);

  // ---- direct access for the module ----
  IHdlNetListNode* AsNode() { return &nodeFace_; }
  IHdlNetListNodeInternal* AsInternal() { return &internalFace_; }
  IHdlElement* GetElement() const { return element_.Get(); }
  IHdlElement* GetInstanceElement() const { return instanceElement_.Get(); }
  const std::vector<IHdlNetListNode*>& Children() const { return children_.Nodes(); }
  // The parents, with null holes where a parent died.
  const std::vector<IHdlNetListNode*>& Parents() const { return parents_.Nodes(); }
  // The first living parent, or null.
  IHdlNetListNode* FirstParent() const;
  // Whether more than one parent links this node (a shared subtree).
  bool HasSeveralParents() const { return parents_.LiveCount() > 1; }
  const Port::StringBase& Name() const { return name_; }
  const Port::StringBase& Kind() const { return kind_; }
  const Port::StringBase& UnitName() const { return unitName_; }
  const Port::StringBase& ArchitectureName() const { return architectureName_; }
  const Port::StringBase& InstanceName() const { return instanceName_; }
  Port::StringBase Path() const;
  const Port::StringBase& Type() const { return type_; }
  bool IsLibraryCell() const { return libraryCell_; }

  // ---- IHdlNetListNodeInternal ----
  CitI::Result AddChildFirst(IHdlNetListNode* child);
  CitI::Result AddChild(IHdlNetListNode* child);
  CitI::Result AddParent(IHdlNetListNode* parent);
  void SetElement(IHdlElement* element) { element_ = element; }
  void SetInstanceElement(IHdlElement* element) { instanceElement_ = element; }
  void SetName(const Port::StringBase& name) { name_ = name; }
  void SetInstanceName(const Port::StringBase& label) { instanceName_ = label; }
  void SetLibraryCell(bool isLibraryCell) { libraryCell_ = isLibraryCell; }
  void SetKind(const Port::StringBase& kind) { kind_ = kind; }
  void SetArchitectureName(const Port::StringBase& name) { architectureName_ = name; }
  void SetUnitName(const Port::StringBase& name) { unitName_ = name; }
  // Path and type of this node from the parent's path, then of every node below from its
  // parent's; a node below with several parents is visited once.
  void ComputePaths(const Port::StringBase& parentPath);

  // ---- IHdlPartitionData ----
  // Empties `out`; reads "PARTITION" of the instance element, or of the element when there is
  // none. 1 when that element answered its properties interface, else 0.
  CitI::Result GetPartition(Port::StringBase& out) const;
  bool IsPartition() const;

  // ---- IInstanceData ----
  // Clears `out`; forwards to the instance element's instance data when it has some (1), else 0.
  CitI::Result QueryInstanceData(bool* out) const;

  // ---- UtilI::ITclCollectable ----
  // "CNetListNode::ITclCollectable -> Name = <path> Type = <type>" and a line end, to standard
  // output.
  void Print() const;

 private:
  class XIHdlNetListNode final : public Prjrep::TFace<IHdlNetListNode, CNetListNode> {
   public:
    using TFace::TFace;
    CitI::Result GetChildren(IHdlNetListNodeIterator** out) override;
    CitI::Result GetParents(IHdlNetListNodeIterator** out) override;
    IHdlElement* GetElement() override { return owner()->GetElement(); }
    CitI::Result GetInstanceName(Port::StringBase* out) override;
    CitI::Result GetUnitName(Port::StringBase* out) override;
    CitI::Result GetArchitectureName(Port::StringBase* out) override;
    CitI::Result Reserved8() override { return CitI::kNotImpl; }
    bool IsLibraryCell() override { return owner()->IsLibraryCell(); }
    CNetListNode* Node() const { return owner(); }
  };

  class XIHdlNetListNodeInternal final : public Prjrep::TFace<IHdlNetListNodeInternal, CNetListNode> {
   public:
    using TFace::TFace;
    CitI::Result AddChildFirst(IHdlNetListNode* child) override { return owner()->AddChildFirst(child); }
    CitI::Result AddChild(IHdlNetListNode* child) override { return owner()->AddChild(child); }
    CitI::Result AddParent(IHdlNetListNode* parent) override { return owner()->AddParent(parent); }
    CitI::Result SetElement(IHdlElement* element) override;
    CitI::Result SetInstanceElement(IHdlElement* element) override;
    CitI::Result SetName(const Port::StringBase& name) override;
    CitI::Result GetName(Port::StringBase* out) override;
    CitI::Result GetKind(Port::StringBase* out) override;
    CitI::Result SetInstanceName(const Port::StringBase& label) override;
    CitI::Result SetLibraryCell(bool isLibraryCell) override;
    CitI::Result SetKind(const Port::StringBase& kind) override;
    CitI::Result SetArchitectureName(const Port::StringBase& name) override;
    CitI::Result SetUnitName(const Port::StringBase& name) override;
    CitI::Result ComputePaths(const Port::StringBase& parentPath) override;
  };

  class XIHdlPartitionData final : public Prjrep::TFace<IHdlPartitionData, CNetListNode> {
   public:
    using TFace::TFace;
    CitI::Result IsPartition(bool* out) override;
    CitI::Result GetPartition(Port::StringBase* out) override;
  };

  class XIInstanceData final : public Prjrep::TFace<IInstanceData, CNetListNode> {
   public:
    using TFace::TFace;
    CitI::Result GetInGenerate(bool* out) override;
  };

  class XITclCollectable final : public Prjrep::TFace<UtilI::ITclCollectable, CNetListNode> {
   public:
    using TFace::TFace;
    CitI::Result GetName(Port::StringBase* out) override;
    CitI::Result GetType(Port::StringBase* out) override;
    CitI::Result GetCollectionId(Port::StringBase* out) override;
    bool Reserved5() override { return false; }
    bool Reserved6() override { return false; }
    CitI::Result Reserved7() override { return CitI::kNotImpl; }
    CitI::Result Reserved8() override { return CitI::kNotImpl; }
    CitI::Result Reserved9() override { return CitI::kNotImpl; }
    CitI::Result Print() override;
  };

  // A path text as a chain of pieces shared with the ancestors' paths, so that the paths of a
  // deep instance chain take linear memory; the text is joined when asked for.
  struct PathPiece {
    PathPiece(std::shared_ptr<const PathPiece> before, Port::StringBase piece)
        : prefix(std::move(before)), text(std::move(piece)) {}
    // Frees a long chain without recursing through it.
    ~PathPiece();
    mutable std::shared_ptr<const PathPiece> prefix;
    Port::StringBase text;
  };
  using PathText = std::shared_ptr<const PathPiece>;

  // Links `child` under this node at the front or the back of the children.
  CitI::Result LinkChild(IHdlNetListNode* child, bool atFront);
  bool ElementUsesPlugin(const char* pluginName) const;
  // Sets this node's path and type below a parent whose path is `parentPath`.
  void SetPathBelow(const PathText& parentPath);

  bool libraryCell_ = false;
  Port::StringBase name_;
  Prjrep::AutoPtr<IHdlElement> element_;
  Prjrep::AutoPtr<IHdlElement> instanceElement_;
  Port::StringBase instanceName_;
  Port::StringBase kind_;
  Port::StringBase unitName_;
  Port::StringBase architectureName_;
  XtHdlNetListNodeSetHelperParent parents_;
  XtHdlNetListNodeSetHelperChild children_;
  // Per child, the index of this node in that child's parent list.
  std::vector<std::size_t> parentSlots_;
  PathText path_;
  Port::StringBase type_;
  Prjrep::TRefCountHelper<CNetListNode> refs_{this};
  XIHdlNetListNode nodeFace_{this};
  XIHdlNetListNodeInternal internalFace_{this};
  XIHdlPartitionData partitionFace_{this};
  XIInstanceData instanceDataFace_{this};
  XITclCollectable tclFace_{this};
};

}  // namespace Vad
