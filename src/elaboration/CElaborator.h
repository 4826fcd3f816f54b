// The elaborator: resolves the design units of a project against each other by name (use
// clauses, instances, primary units), builds the instance hierarchy from those links and orders
// the source files for compilation.
#pragma once

#include <cstdint>
#include <map>
#include <string_view>
#include <vector>

#include "CitI.h"
#include "HdlSets.h"
#include "IHdlElement.h"
#include "IHdlNetListNode.h"
#include "IHdlParserConfig.h"
#include "IHdlProject.h"
#include "Port/StringBase.h"
#include "Prjrep/TRefCountHelper.h"
#include "module.h"

namespace Vad {

class CLibRefs;
class CNetListNode;

// Design-object type masks the elaborator sorts units by (type codes of DbType).
namespace ElabMask {
// Entity, Architecture, PackageDecl, PackageBody.
inline constexpr std::uint32_t kVhdlUnit = 0xC6;
// Architecture, Module, and PackageDecl: a configuration declaration is kept as a package
// declaration whose entity instances are the architectures it configures.
inline constexpr std::uint32_t kContainsInstances = 0x2044;
// Architecture, PackageBody.
inline constexpr std::uint32_t kHasPrimaryUnit = 0x84;
// kVhdlUnit plus Module and Generic.
inline constexpr std::uint32_t kKnownUnit = 0x60C6;
}  // namespace ElabMask

// The texts the elaborator reports and records.
namespace ElabText {
inline constexpr const char* kDuplicateName = "Duplicate name in ProcessElement(): %s\n";
inline constexpr const char* kNameExists =
    "Error: CElaborator::AddDependencyCountName - Name already exists.  This should not have occurred and a "
    "CR should be recored.\n";
inline constexpr const char* kCircularReference = "Circular Reference: %s\n";
inline constexpr const char* kUnknownType = "DU Type Unknown";
inline constexpr const char* kDuplicateSuffix = "****DUPLICATE_%d_DUPLICATE****";
inline constexpr const char* kDuplicateStart = "****DUPLICATE_";
inline constexpr const char* kDuplicateEnd = "_DUPLICATE****";
}  // namespace ElabText

// Orders text by the host comparison with letter case folded (comparison mode 1).
struct ModeOneLess {
  bool operator()(const Port::StringBase& a, const Port::StringBase& b) const {
    return a.Compare(b.view(), Port::kCompareNoCase) < 0;
  }
};

// The six name tables of one elaboration. Element pointers are borrowed from the project for
// the duration of the run.
struct CElabTables {
  // The units registered under one short key and library: their qualified full keys.
  // The architectures of one entity all stand here, the one bound by default first.
  struct RegisteredUnit {
    std::vector<Port::StringBase> keys;
    Port::StringBase library;
    std::vector<IHdlElement*> elements;  // one per key
  };

  // Qualified unit name -> instance labels, with an empty text per use-clause package and
  // primary-unit link, or "DU Type Unknown".
  std::map<Port::StringBase, std::vector<Port::StringBase>> m_sElementNameInstanceList;
  // Instance key -> the instance's element; the first one stored for a key stays.
  std::map<Port::StringBase, IHdlElement*> m_IHdlElementInstanceNameMap;
  // Qualified unit name or target key -> how many references point at it.
  std::map<Port::StringBase, std::uint32_t> m_ElementNameDependencyCountMap;
  // Qualified unit name -> target keys, one per reference, in source order.
  std::map<Port::StringBase, std::vector<Port::StringBase>> m_DependsTable;
  // Short unit key -> the first unit of each library registered under it.
  std::multimap<Port::StringBase, RegisteredUnit, ModeOneLess> m_sArchitectureMultiMapList;
  // Design-unit key (with a duplicate suffix for a duplicate) -> every registered unit.
  std::multimap<Port::StringBase, IHdlElement*, ModeOneLess> m_piHdlElementMultiMapNames;
};

// Units renamed as duplicates during registration (borrowed pointers).
using DuplicateList = std::vector<IHdlElement*>;
// Nodes created without an element, in creation order (owned by the tree).
using MissingNodeList = std::vector<CNetListNode*>;
// Qualified unit names and whether the tree building has reached them.
using VisitedMap = std::map<Port::StringBase, bool>;

// Counted through its Prjrep::TRefCountHelper (count 1 at construction). QueryInterface answers
// Prjrep::IRefCount with the counter and IInterface with the object itself; anything else null.
// It keeps no state between calls: every run works on a tables object of its own.
//
// Results: 1 success, kInvalidArg (0x1100000000000003) for a missing argument, 0 failure.
class CElaborator final : public CitI::IInterface {
 public:
  class CMissingFileDU;

  CElaborator() = default;
  // Public for the class factory; the object is otherwise ended by its reference count.
  ~CElaborator() override = default;

  // With sharing (the default) a node without an instance label whose unit lies on no reference
  // cycle is built once per elaboration and linked under every parent that references the unit;
  // without it such a unit is expanded again under every parent. Both give the same tree to a
  // walk through GetChildren.
  void SetShareSubtrees(bool share) { shareSubtrees_ = share; }

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // ---- what the project calls ----
  // Registers and resolves every unit of `elements` and builds the hierarchy tree of the
  // project, asking `libraryReferences` (the project's, at its device family) about units the
  // project does not hold. On success `root` receives the unnamed root with one reference for
  // the caller.
  CitI::Result Elaborate(CLibRefs* libraryReferences, IHdlDesignUnitIterator* elements,
                         IHdlNetListNode** root);
  // Puts one placeholder node per VHDL or Verilog file without design units in front of the
  // root's children, in ascending order key. kInvalidArg without a root; without files nothing
  // is added.
  CitI::Result AddMissingFileNodes(IHdlNetListNode* root, IHdlFileIterator* files);

  // ---- the phases of an elaboration, on one tables object ----
  // Registers every unit of `elements` except generics; renamed duplicates go to `duplicates`.
  CitI::Result RegisterDesignUnits(CElabTables& tables, IHdlDesignUnitIterator* elements,
                                   DuplicateList& duplicates);
  // Resolves the use clauses, instances and primary unit of one registered unit.
  CitI::Result ProcessElement(CElabTables& tables, const Port::StringBase& name, IHdlElement* element);
  // Inserts `name` with count 0; an existing name keeps its count (with a debug text).
  // kInvalidArg for an empty name.
  CitI::Result AddDependencyCountName(CElabTables& tables, const Port::StringBase& name);
  // The short and full unit keys of an element by its type; both empty for other types.
  CitI::Result MakeUnitKeys(IHdlElement* element, Port::StringBase& shortKey, Port::StringBase& fullKey);
  // The qualified full keys registered under `shortKey`, preferring `library`; null when none.
  const std::vector<Port::StringBase>* FindRegisteredKey(const CElabTables& tables,
                                                         const Port::StringBase& shortKey,
                                                         const Port::StringBase& library, bool exact) const;
  // The registered unit under `name`, preferring `library`; null when none.
  IHdlElement* FindRegisteredElement(const CElabTables& tables, const Port::StringBase& name,
                                     const Port::StringBase& library, bool exact) const;
  // Reference resolution: the target key a reference resolves to, or empty.
  Port::StringBase ResolveEntityRef(const CElabTables& tables, const Port::StringBase& dottedName,
                                    const Port::StringBase& architecture,
                                    const Port::StringBase& library) const;
  Port::StringBase ResolveModuleRef(const CElabTables& tables, const Port::StringBase& name,
                                    const Port::StringBase& library) const;
  Port::StringBase ResolvePrimaryEntity(const CElabTables& tables, const Port::StringBase& entity,
                                        const Port::StringBase& library) const;
  Port::StringBase ResolvePackage(const CElabTables& tables, const Port::StringBase& package,
                                  const Port::StringBase& library) const;
  // Appends to the dependency list / instance-label list of `name` (creating the entry).
  // kInvalidArg for an empty name.
  CitI::Result AddDepends(CElabTables& tables, const Port::StringBase& name, const Port::StringBase& target);
  CitI::Result AddInstanceLabel(CElabTables& tables, const Port::StringBase& name,
                                const Port::StringBase& label);
  // The lists stored for `name`, or null.
  const std::vector<Port::StringBase>* FindDepends(const CElabTables& tables,
                                                   const Port::StringBase& name) const;
  const std::vector<Port::StringBase>* FindInstanceLabels(const CElabTables& tables,
                                                          const Port::StringBase& name) const;
  // "lib:key" -> library part and key part (the last two ":"-separated tokens; without a colon
  // the library part is empty).
  static void SplitQualifiedName(const Port::StringBase& qualified, Port::StringBase& library,
                                 Port::StringBase& key);
  // "lib.name" -> library part and the last part (without a dot the library part is empty).
  static void SplitDottedName(const Port::StringBase& dotted, Port::StringBase& library,
                              Port::StringBase& name);
  // "%s:%s" of library and name; the bare name when the library is empty.
  static Port::StringBase Qualify(const Port::StringBase& library, const Port::StringBase& name);
  // Writes the six tables to standard output.
  void DumpTables(const CElabTables& tables) const;

  // ---- the hierarchy tree ----
  // A new node (through the registry) with its element and name fields, appended to `parent`'s
  // children when a parent is given. `out` receives the node with one reference for the caller.
  CitI::Result CreateNetListNode(const Port::StringBase& name, IHdlElement* element, IHdlNetListNode* parent,
                                 IHdlNetListNode** out);
  // Sets the node name and, from its bar-separated parts, kind, unit and architecture fields.
  CitI::Result SetNodeNameFields(IHdlNetListNode* node, const Port::StringBase& name);
  // The registered element for a qualified key ("lib:key"; no library means "work"), or null
  // when none is registered in that library. kInvalidArg for an empty key or a null out.
  CitI::Result FindElementByKey(const CElabTables& tables, const Port::StringBase& qualifiedKey, bool exact,
                                IHdlElement** out) const;
  // One top node under `root` per unit that nothing references (and per unit reached only
  // through a cycle), each with its subtree; then library-cell tests for the missing units.
  CitI::Result BuildHierarchy(CElabTables& tables, CLibRefs* libraryReferences, IHdlNetListNode* root);
  // The children of `node` for the references of unit `name`, and theirs below; `path` carries
  // the chain of units above ("|*unit|" each), so that a unit that reaches itself is cut with a
  // warning. `path` is the same on return.
  CitI::Result BuildSubtree(CElabTables& tables, VisitedMap& visited, MissingNodeList& missing,
                            IHdlNetListNode* node, const Port::StringBase& name, Port::StringBase& path);
  // Whether a node without element stands for a cell of the maker's libraries.
  CitI::Result TestLibraryCell(CElabTables& tables, CLibRefs* libraryReferences, IHdlNetListNode* node,
                               bool* isLibraryCell);
  // Removes the duplicate suffix from the names of the root's direct children whose element is
  // one of `duplicates`.
  CitI::Result StripDuplicateSuffixes(const DuplicateList& duplicates, IHdlNetListNode* root);
  // Writes the subtree of `node` to standard output, indented by `depth`; a shared subtree in
  // full once, later only its node.
  CitI::Result DumpTree(IHdlNetListNode* node, int depth) const;

 private:
  struct HierarchyBuild;
  struct BuildFrame;

  // Builds the subtree below `node` for unit `name` without recursing; 0 when `name` is already
  // on the build's chain (with the warning).
  CitI::Result ExpandSubtree(HierarchyBuild& build, IHdlNetListNode* node, const Port::StringBase& name);
  // Marks `name` visited and, unless it is on the chain (warning, false), opens its frame.
  bool EnterUnit(HierarchyBuild& build, std::vector<BuildFrame>& frames, IHdlNetListNode* node,
                 const Port::StringBase& name) const;
  // Makes or links the child of the top frame for its next reference.
  CitI::Result AddNextChild(HierarchyBuild& build, std::vector<BuildFrame>& frames);
  // Increments the count of `target`, or inserts it with count 0.
  static void CountReference(CElabTables& tables, const Port::StringBase& target);
  CitI::Result ProcessUseClauses(CElabTables& tables, const Port::StringBase& qualified, DbObject* unit,
                                 const Port::StringBase& library);
  CitI::Result ProcessInstances(CElabTables& tables, const Port::StringBase& qualified, DbObject* unit,
                                const Port::StringBase& library);
  CitI::Result ProcessPrimaryUnit(CElabTables& tables, const Port::StringBase& qualified, DbObject* unit,
                                  const Port::StringBase& library);
  // The target key of an instance, with its reference counted when it resolves.
  Port::StringBase InstanceTarget(CElabTables& tables, DbObject* child, const Port::StringBase& library,
                                  Port::StringBase& label);
  // Registers `fullKey` under `shortKey` unless the library already has an entry; another
  // architecture of an entity joins the entry of its entity's first one.
  CitI::Result RegisterShortKey(CElabTables& tables, const Port::StringBase& shortKey,
                                const Port::StringBase& fullKey, const Port::StringBase& library,
                                IHdlElement* element);
  // Puts the architecture VHDL binds by default (ArchitectureChoice) first in each entry.
  static void PutDefaultArchitecturesFirst(CElabTables& tables);
  // Gives `child` the instance element stored under `instanceKey`, when there is one.
  static void AttachInstanceElement(const CElabTables& tables, CNetListNode* child,
                                    const Port::StringBase& instanceKey);
  // Whether basecell, blockcell or timecell declares `cell` in any package.
  bool AskCellLibraries(CLibRefs* libraryReferences, const Port::StringBase& cell,
                        const char* language) const;
  // Whether a package that one of `unit`'s use clauses names declares `cell`.
  bool AskUseClauses(const CElabTables& tables, CLibRefs* libraryReferences, DbObject* unit,
                     const Port::StringBase& cell) const;

  Prjrep::TRefCountHelper<CElaborator> refs_{this};
  bool shareSubtrees_ = true;
};

// Stands in the hierarchy for a VHDL or Verilog source file that yielded no design unit: a
// module record with an empty name whose source file is the file given at creation.
class CElaborator::CMissingFileDU final : public module {
 public:
  explicit CMissingFileDU(IHdlFile* file);
  ~CMissingFileDU() override = default;
};

}  // namespace Vad
