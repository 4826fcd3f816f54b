// The nodes of the instance hierarchy as the host walks them, with the sets and iterators over a
// node's children and parents.
#pragma once

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"
#include "Prjrep/ISet.h"

namespace Vad {

class IHdlElement;
class IHdlNetListNode;

class IHdlNetListNodeIterator : public Prjrep::IIteratorOf<IHdlNetListNode> {
 public:
  QUILLON_INTERFACE_ID("{d8037499-72c2-408a-a214-da8ba01392ce}")
};

class IHdlNetListNodeSet : public Prjrep::ISetOf<IHdlNetListNode, IHdlNetListNodeIterator> {
 public:
  QUILLON_INTERFACE_ID("{ccd17b7b-712d-4e3f-b59c-f59f7251df82}")
};

// One node of the hierarchy: a design unit (or a unit that is not in the project) in the place
// where an instance, a use clause or a primary-unit link put it. Null out-parameters give
// kInvalidArg.
class IHdlNetListNode : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlNetListNode)
  // Slot 2. A new iterator over the children, in child order.
  virtual CitI::Result GetChildren(IHdlNetListNodeIterator** out) = 0;
  // Slot 3. A new iterator over the nodes that hold this node as a child.
  virtual CitI::Result GetParents(IHdlNetListNodeIterator** out) = 0;
  // Slot 4. The design unit behind the node, borrowed (valid while the node lives; no reference
  // added), or null for a unit that is not in the project and for the root.
  virtual IHdlElement* GetElement() = 0;
  // Slot 5. The label of the instance that created the node; empty for top nodes.
  virtual CitI::Result GetInstanceName(Port::StringBase* out) = 0;
  // Slot 6. The second bar-separated part of the node name (entity or module name).
  virtual CitI::Result GetUnitName(Port::StringBase* out) = 0;
  // Slot 7. The third bar-separated part of the node name (architecture name).
  virtual CitI::Result GetArchitectureName(Port::StringBase* out) = 0;
  // Slot 8. Not provided: kNotImpl.
  virtual CitI::Result Reserved8() = 0;
  // Slot 9. Whether the node stands for a cell of the maker's libraries.
  virtual bool IsLibraryCell() = 0;
};

// What the elaborator uses to build the tree. Null out-parameters give kInvalidArg.
class IHdlNetListNodeInternal : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlNetListNodeInternal)
  // Slots 2 and 3. Put `child` in front of / after the existing children (one reference taken)
  // and make this node its parent. kInvalidArg for a null child.
  virtual CitI::Result AddChildFirst(IHdlNetListNode* child) = 0;
  virtual CitI::Result AddChild(IHdlNetListNode* child) = 0;
  // Slot 4. Records `parent` without taking a reference. kInvalidArg for null.
  virtual CitI::Result AddParent(IHdlNetListNode* parent) = 0;
  // Slots 5 and 6. Replace the element / the instance element (one reference held; null clears).
  virtual CitI::Result SetElement(IHdlElement* element) = 0;
  virtual CitI::Result SetInstanceElement(IHdlElement* element) = 0;
  // Slots 7 and 8. The node name.
  virtual CitI::Result SetName(const Port::StringBase& name) = 0;
  virtual CitI::Result GetName(Port::StringBase* out) = 0;
  // Slot 9. The first bar-separated part of the node name.
  virtual CitI::Result GetKind(Port::StringBase* out) = 0;
  // Slots 10 to 14.
  virtual CitI::Result SetInstanceName(const Port::StringBase& label) = 0;
  virtual CitI::Result SetLibraryCell(bool isLibraryCell) = 0;
  virtual CitI::Result SetKind(const Port::StringBase& kind) = 0;
  virtual CitI::Result SetArchitectureName(const Port::StringBase& name) = 0;
  virtual CitI::Result SetUnitName(const Port::StringBase& name) = 0;
  // Slot 15. Sets the Tcl path and type of this node and of its whole subtree.
  virtual CitI::Result ComputePaths(const Port::StringBase& parentPath) = 0;
};

// The partition mark of a node: the "PARTITION" property of its instance (or, for a top node,
// of its unit).
class IHdlPartitionData : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlPartitionData)
  // Slot 2. True when the partition text is non-empty; kInvalidArg for a null out-parameter.
  virtual CitI::Result IsPartition(bool* out) = 0;
  // Slot 3. Empties `out` and reads the property; 1 when the element answered its properties
  // interface, else 0.
  virtual CitI::Result GetPartition(Port::StringBase* out) = 0;
};

}  // namespace Vad
