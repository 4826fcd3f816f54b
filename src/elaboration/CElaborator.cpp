#include "CElaborator.h"

#include <algorithm>
#include <boost/graph/adjacency_list.hpp>
#include <boost/graph/strong_components.hpp>
#include <cstdio>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "Arch.h"
#include "ArchitectureChoice.h"
#include "CHdlElement.h"
#include "CLibRefs.h"
#include "CNetListNode.h"
#include "CVhdlDU.h"
#include "CompInst.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "Host/VhdlName.h"
#include "IHdlDUProperties.h"
#include "Identifiers.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "Prjrep/Casts.h"
#include "SourceFileLink.h"
#include "Use.h"

namespace Vad {
namespace {

constexpr const char* kMessageCategory = "ProjectMgmt";
constexpr const char* kMessageSource = "../src/CElaborator";
constexpr const char* kRevision = "1.1";

// The creator identifier of module instances recorded by the Verilog parser.
const Port::XUID& VerilogInstanceTypeId() {
  static const Port::XUID id{std::string_view("{4767A2DD-D3AE-4b52-9042-59EAAF25C023}")};
  return id;
}

// Libraries whose units the project does not hold: use clauses of these are not followed.
constexpr const char* kUntrackedUseLibraries[] = {"ieee",     "basecell",       "blockcell",
                                                  "timecell", "corvanecorelib", "std"};
// Libraries whose entities are not tracked when an instance names them.
constexpr const char* kUntrackedEntityLibraries[] = {"basecell", "ieee", "blockcell", "timecell"};
// The cell libraries asked about units that are not in the project, in this order.
constexpr const char* kCellLibraries[] = {"basecell", "blockcell", "timecell"};

bool ModeOneEqual(const Port::StringBase& a, std::string_view b) { return a.Equals(b, Port::kCompareNoCase); }

// Unit keys name their kind first: Verilog module names keep their letter case, VHDL names follow
// the VHDL rule (basic identifiers fold, extended identifiers do not).
bool SameUnitKey(std::string_view a, std::string_view b) {
  constexpr std::string_view kModulePrefix = "Module|";
  if (a.substr(0, kModulePrefix.size()) == kModulePrefix) return a == b;
  return Host::SameVhdlName(a, b);
}

template <std::size_t N>
bool IsOneOf(const Port::StringBase& text, const char* const (&list)[N]) {
  return std::any_of(std::begin(list), std::end(list),
                     [&](const char* entry) { return ModeOneEqual(text, entry); });
}

DbObject* DesignObjectOf(CitI::IInterface* element) { return Prjrep::ImplementationCast<DbObject>(element); }

Port::StringBase LibraryOf(CitI::IInterface* element) {
  Port::StringBase library;
  if (auto* hdlElement = Prjrep::ImplementationCast<CHdlElement>(element))
    hdlElement->GetLibraryName(&library);
  return library;
}

Port::StringBase Formatted(const char* format, const Port::StringBase& a) {
  Port::StringBase text;
  text.Format(format, a.c_str());
  return text;
}

Port::StringBase Formatted(const char* format, const Port::StringBase& a, const Port::StringBase& b) {
  Port::StringBase text;
  text.Format(format, a.c_str(), b.c_str());
  return text;
}

// Splits at `separator`, keeping empty pieces, so that "A||B" keeps B in third place.
std::vector<Port::StringBase> SplitKeepingEmpty(const Port::StringBase& text, char separator) {
  std::vector<Port::StringBase> pieces;
  std::size_t start = 0;
  while (true) {
    std::size_t end = text.Find(separator, start);
    pieces.push_back(text.Mid(start, end == Port::StringBase::npos ? Port::StringBase::npos : end - start));
    if (end == Port::StringBase::npos) break;
    start = end + 1;
  }
  return pieces;
}

// The last two `separator`-separated pieces of `text`: the one before the last, and the last.
void SplitLastTwo(const Port::StringBase& text, char separator, Port::StringBase& before,
                  Port::StringBase& last) {
  before.Empty();
  last.Empty();
  std::vector<Port::StringBase> pieces = SplitKeepingEmpty(text, separator);
  last = pieces.back();
  if (pieces.size() >= 2) before = pieces[pieces.size() - 2];
}

std::unique_ptr<Port_MsgManData> Messages(int line) {
  return Port_MsgManData::createObject(kMessageCategory, kMessageSource, line, kRevision);
}

bool SameObject(CitI::IInterface* a, CitI::IInterface* b) {
  return a && b && a->QueryInterface(CitI::IInterface::Iid()) == b->QueryInterface(CitI::IInterface::Iid());
}

// The library, package and item a use clause names, with the shorthand forms spelled out.
struct UseParts {
  Port::StringBase library;
  Port::StringBase package;
  Port::StringBase item;
};

}  // namespace

// ---- the object ----------------------------------------------------------------------------------

CitI::IInterface* CElaborator::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid() || id == Prjrep::IRefCountV1::Iid()) return &refs_;
  // The factory and the project reach the object through IInterface.
  if (id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CElaborator::CMissingFileDU::CMissingFileDU(IHdlFile* file) : module(std::string_view(), nullptr) {
  SetUnitFlag(false);
  SetFile(file);
  Port::StringBase key;
  key.Format("%s|%s", GetTypeName(), GetModuleName().c_str());
  SetKey(key.view());
}

// ---- name forms ----------------------------------------------------------------------------------

Port::StringBase CElaborator::Qualify(const Port::StringBase& library, const Port::StringBase& name) {
  if (library.IsEmpty()) return name;
  return Formatted("%s:%s", library, name);
}

void CElaborator::SplitQualifiedName(const Port::StringBase& qualified, Port::StringBase& library,
                                     Port::StringBase& key) {
  SplitLastTwo(qualified, ':', library, key);
}

void CElaborator::SplitDottedName(const Port::StringBase& dotted, Port::StringBase& library,
                                  Port::StringBase& name) {
  SplitLastTwo(dotted, '.', library, name);
}

CitI::Result CElaborator::MakeUnitKeys(IHdlElement* element, Port::StringBase& shortKey,
                                       Port::StringBase& fullKey) {
  shortKey.Empty();
  fullKey.Empty();
  if (!element) return CitI::kInvalidArg;
  DbObject* unit = DesignObjectOf(element);
  if (!unit) return CitI::kFail;
  switch (unit->GetType()) {
    case DbType::kArchitecture:
      if (auto* arch = dynamic_cast<Arch*>(unit)) {
        fullKey = Formatted("Architecture|%s|%s", arch->GetEntityName(), arch->GetArchitectureName());
        shortKey = Formatted("Architecture|%s", arch->GetEntityName());
      }
      break;
    case DbType::kModule:
      if (auto* mod = dynamic_cast<module*>(unit))
        fullKey = shortKey = Formatted("Module|%s", mod->GetModuleName());
      break;
    case DbType::kPackageDecl:
      if (auto* package = dynamic_cast<PackageDecl*>(unit))
        fullKey = shortKey = Formatted("PackageDecl|%s", package->GetPackageName());
      break;
    case DbType::kPackageBody:
      if (auto* body = dynamic_cast<PackageBody*>(unit))
        fullKey = shortKey = Formatted("PackageBody|%s", body->GetPackageName());
      break;
    case DbType::kEntity:
      if (auto* entity = dynamic_cast<EntityDecl*>(unit))
        fullKey = shortKey = Formatted("Entity|%s", entity->GetEntityName());
      break;
    default:
      break;
  }
  return CitI::kOk;
}

// ---- table look-ups ------------------------------------------------------------------------------

const std::vector<Port::StringBase>* CElaborator::FindRegisteredKey(const CElabTables& tables,
                                                                    const Port::StringBase& shortKey,
                                                                    const Port::StringBase& library,
                                                                    bool exact) const {
  const CElabTables::RegisteredUnit* chosen = nullptr;
  auto [first, last] = tables.m_sArchitectureMultiMapList.equal_range(shortKey);
  for (auto entry = first; entry != last; ++entry) {
    if (exact && !SameUnitKey(entry->first, shortKey)) continue;
    chosen = &entry->second;
    if (ModeOneEqual(entry->second.library, library)) break;
  }
  return chosen ? &chosen->keys : nullptr;
}

IHdlElement* CElaborator::FindRegisteredElement(const CElabTables& tables, const Port::StringBase& name,
                                                const Port::StringBase& library, bool exact) const {
  IHdlElement* chosen = nullptr;
  auto [first, last] = tables.m_piHdlElementMultiMapNames.equal_range(name);
  for (auto entry = first; entry != last; ++entry) {
    if (exact && !SameUnitKey(entry->first, name)) continue;
    chosen = entry->second;
    if (std::next(entry) == last || ModeOneEqual(LibraryOf(chosen), library)) break;
  }
  return chosen;
}

const std::vector<Port::StringBase>* CElaborator::FindDepends(const CElabTables& tables,
                                                              const Port::StringBase& name) const {
  auto found = tables.m_DependsTable.find(name);
  return found == tables.m_DependsTable.end() ? nullptr : &found->second;
}

const std::vector<Port::StringBase>* CElaborator::FindInstanceLabels(const CElabTables& tables,
                                                                     const Port::StringBase& name) const {
  auto found = tables.m_sElementNameInstanceList.find(name);
  return found == tables.m_sElementNameInstanceList.end() ? nullptr : &found->second;
}

// ---- table updates -------------------------------------------------------------------------------

CitI::Result CElaborator::AddDependencyCountName(CElabTables& tables, const Port::StringBase& name) {
  if (name.IsEmpty()) return CitI::kInvalidArg;
  if (!tables.m_ElementNameDependencyCountMap.try_emplace(name, 0).second)
    Port_MsgManData::debugStub("%s", ElabText::kNameExists);
  return CitI::kOk;
}

void CElaborator::CountReference(CElabTables& tables, const Port::StringBase& target) {
  auto [entry, inserted] = tables.m_ElementNameDependencyCountMap.try_emplace(target, 0);
  if (!inserted) ++entry->second;
}

CitI::Result CElaborator::AddDepends(CElabTables& tables, const Port::StringBase& name,
                                     const Port::StringBase& target) {
  if (name.IsEmpty()) return CitI::kInvalidArg;
  tables.m_DependsTable[name].push_back(target);
  return CitI::kOk;
}

CitI::Result CElaborator::AddInstanceLabel(CElabTables& tables, const Port::StringBase& name,
                                           const Port::StringBase& label) {
  if (name.IsEmpty()) return CitI::kInvalidArg;
  tables.m_sElementNameInstanceList[name].push_back(label);
  return CitI::kOk;
}

CitI::Result CElaborator::RegisterShortKey(CElabTables& tables, const Port::StringBase& shortKey,
                                           const Port::StringBase& fullKey, const Port::StringBase& library,
                                           IHdlElement* element) {
  if (shortKey.IsEmpty() || library.IsEmpty()) return CitI::kInvalidArg;
  Port::StringBase qualified = Qualify(library, fullKey);
  auto [first, last] = tables.m_sArchitectureMultiMapList.equal_range(shortKey);
  for (auto entry = first; entry != last; ++entry) {
    if (!SameUnitKey(entry->first, shortKey) || !ModeOneEqual(entry->second.library, library)) continue;
    CElabTables::RegisteredUnit& unit = entry->second;
    // Only architectures share a short key without sharing the full key.
    if (!SameUnitKey(fullKey, shortKey)) {
      unit.keys.push_back(qualified);
      unit.elements.push_back(element);
    }
    return CitI::kOk;
  }
  tables.m_sArchitectureMultiMapList.emplace(shortKey,
                                             CElabTables::RegisteredUnit{{qualified}, library, {element}});
  return CitI::kOk;
}

void CElaborator::PutDefaultArchitecturesFirst(CElabTables& tables) {
  for (auto& [shortKey, unit] : tables.m_sArchitectureMultiMapList) {
    if (unit.elements.size() < 2) continue;
    auto chosen =
        std::find(unit.elements.begin(), unit.elements.end(), ArchitectureChoice::Default(unit.elements));
    auto index = chosen - unit.elements.begin();
    std::rotate(unit.elements.begin(), chosen, chosen + 1);
    std::rotate(unit.keys.begin(), unit.keys.begin() + index, unit.keys.begin() + index + 1);
  }
}

// ---- registration --------------------------------------------------------------------------------

CitI::Result CElaborator::RegisterDesignUnits(CElabTables& tables, IHdlDesignUnitIterator* elements,
                                              DuplicateList& duplicates) {
  if (!elements) return CitI::kInvalidArg;
  int duplicateCount = 0;
  for (elements->First(); !elements->IsDone(); elements->Next()) {
    auto* element = Prjrep::QueryAs<IHdlElement>(elements->Current());
    DbObject* unit = DesignObjectOf(element);
    // A unit of another module cannot be resolved by name; it is left out rather than ending the run.
    if (!unit || unit->GetType() == DbType::kGeneric) continue;

    Port::StringBase library = LibraryOf(element);
    Port::StringBase name;
    unit->GetDesignUnitKey(name);
    Port::StringBase shortKey;
    Port::StringBase fullKey;
    MakeUnitKeys(element, shortKey, fullKey);

    IHdlElement* registered = FindRegisteredElement(tables, name, library, true);
    if (registered && ModeOneEqual(LibraryOf(registered), library)) {
      Port::StringBase suffix;
      suffix.Format(ElabText::kDuplicateSuffix, ++duplicateCount);
      name.Append(suffix.view());
      shortKey.Append(suffix.view());
      fullKey.Append(suffix.view());
      duplicates.push_back(element);
    }

    RegisterShortKey(tables, shortKey, fullKey, library, element);
    tables.m_piHdlElementMultiMapNames.emplace(name, element);
    CitI::Result result = AddDependencyCountName(tables, Qualify(library, name));
    if (result != CitI::kOk) return result;
  }
  PutDefaultArchitecturesFirst(tables);
  return CitI::kOk;
}

// ---- resolution ----------------------------------------------------------------------------------

namespace {

const Port::StringBase& FirstOf(const std::vector<Port::StringBase>* keys) {
  static const Port::StringBase kEmpty;
  return keys && !keys->empty() ? keys->front() : kEmpty;
}

}  // namespace

Port::StringBase CElaborator::ResolvePackage(const CElabTables& tables, const Port::StringBase& package,
                                             const Port::StringBase& library) const {
  return FirstOf(FindRegisteredKey(tables, Formatted("PackageDecl|%s", package), library, true));
}

Port::StringBase CElaborator::ResolvePrimaryEntity(const CElabTables& tables, const Port::StringBase& entity,
                                                   const Port::StringBase& library) const {
  return FirstOf(FindRegisteredKey(tables, Formatted("Entity|%s", entity), library, true));
}

Port::StringBase CElaborator::ResolveModuleRef(const CElabTables& tables, const Port::StringBase& name,
                                               const Port::StringBase& library) const {
  Port::StringBase target = FirstOf(FindRegisteredKey(tables, Formatted("Module|%s", name), library, true));
  if (target.IsEmpty())
    target = FirstOf(FindRegisteredKey(tables, Formatted("Architecture|%s", name), library, true));
  if (target.IsEmpty())
    target = FirstOf(FindRegisteredKey(tables, Formatted("Architecture|%s", name), library, false));
  return target;
}

Port::StringBase CElaborator::ResolveEntityRef(const CElabTables& tables, const Port::StringBase& dottedName,
                                               const Port::StringBase& architecture,
                                               const Port::StringBase& library) const {
  Port::StringBase entityLibrary;
  Port::StringBase entity;
  SplitDottedName(dottedName, entityLibrary, entity);
  // "work" names the library of the referring unit.
  if (entityLibrary.IsEmpty() || ModeOneEqual(entityLibrary, "work")) entityLibrary = library;
  if (IsOneOf(entityLibrary, kUntrackedEntityLibraries)) return {};

  const auto* keys = FindRegisteredKey(tables, Formatted("Architecture|%s", entity), entityLibrary, true);
  if (keys && architecture.IsEmpty()) return FirstOf(keys);
  if (keys) {
    Port::StringBase wanted = Qualify(entityLibrary, Formatted("Architecture|%s|%s", entity, architecture));
    for (const Port::StringBase& key : *keys) {
      if (Host::SameVhdlName(key, wanted)) return key;
    }
    return {};
  }
  if (!architecture.IsEmpty()) return {};
  Port::StringBase target =
      FirstOf(FindRegisteredKey(tables, Formatted("Module|%s", entity), entityLibrary, true));
  if (target.IsEmpty())
    target = FirstOf(FindRegisteredKey(tables, Formatted("Module|%s", entity), entityLibrary, false));
  // An instance of a configuration ("u : configuration lib.cfg") names the package declaration
  // that keeps the configuration.
  if (target.IsEmpty()) target = ResolvePackage(tables, entity, entityLibrary);
  return target;
}

// ---- processing one unit -------------------------------------------------------------------------

namespace {

// Spells out the shorthand forms of a use clause: "use lib.pkg;" (a registered package),
// "use pkg.item;" (the first part is a package of the working library) and "use lib;".
UseParts SplitUseClause(const CElaborator& elaborator, const CElabTables& tables, const Use& use,
                        const Port::StringBase& unitLibrary) {
  UseParts parts{use.GetLibraryPart(), use.GetPackagePart(), use.GetItemPart()};
  if (parts.item.IsEmpty()) {
    if (!parts.package.IsEmpty()) {
      Port::StringBase packageKey = Formatted("PackageDecl|%s", parts.package);
      Port::StringBase library = ModeOneEqual(parts.library, "work") ? unitLibrary : parts.library;
      bool namesPackage = tables.m_DependsTable.count(CElaborator::Qualify(parts.library, packageKey)) != 0 ||
                          elaborator.FindRegisteredKey(tables, packageKey, library, true) != nullptr;
      parts.item = parts.package;
      if (!namesPackage) parts.package = "*";
    } else {
      parts.package = "*";
      parts.item = "all";
    }
  }
  if (parts.package == "*") {
    parts.package = parts.library;
    parts.library = "work";
  }
  return parts;
}

std::vector<Use*> UsesOf(DbObject* unit) {
  std::vector<Use*> uses;
  auto* vhdlUnit = dynamic_cast<CVhdlDU*>(unit);
  if (!vhdlUnit) return uses;
  std::vector<DbObject*> objects;
  vhdlUnit->GetUses(objects);
  for (DbObject* object : objects) {
    if (auto* use = dynamic_cast<Use*>(object)) uses.push_back(use);
  }
  return uses;
}

}  // namespace

CitI::Result CElaborator::ProcessUseClauses(CElabTables& tables, const Port::StringBase& qualified,
                                            DbObject* unit, const Port::StringBase& library) {
  for (Use* use : UsesOf(unit)) {
    UseParts parts = SplitUseClause(*this, tables, *use, library);
    bool inWork = ModeOneEqual(parts.library, "work");
    if (!inWork && IsOneOf(parts.library, kUntrackedUseLibraries)) continue;
    // A package named with its library is looked for in that library.
    const Port::StringBase& packageLibrary = inWork || parts.library.IsEmpty() ? library : parts.library;
    Port::StringBase target = ResolvePackage(tables, parts.package, packageLibrary);
    if (target.IsEmpty())
      target = Qualify(packageLibrary, Formatted("PackageDecl|%s", parts.package));
    else
      CountReference(tables, target);
    CitI::Result result = AddDepends(tables, qualified, target);
    if (result == CitI::kOk) result = AddInstanceLabel(tables, qualified, {});
    if (result != CitI::kOk) return result;
  }
  return CitI::kOk;
}

Port::StringBase CElaborator::InstanceTarget(CElabTables& tables, DbObject* child,
                                             const Port::StringBase& library, Port::StringBase& label) {
  Port::StringBase target;
  if (auto* component = dynamic_cast<CompInst*>(child);
      component && child->GetType() == DbType::kComponentInstantiation) {
    label = component->GetLabel();
    const Port::StringBase& name = component->GetComponentName();
    bool verilog = component->GetDesignUnitTypeId() == VerilogInstanceTypeId();
    target = verilog ? ResolveModuleRef(tables, name, library) : ResolveEntityRef(tables, name, {}, library);
    // A unit missing from the project is named by the kind its reference implies.
    if (target.IsEmpty()) return Qualify(library, Formatted(verilog ? "Module|%s" : "Architecture|%s", name));
  } else if (auto* entity = dynamic_cast<EntityInst*>(child);
             entity && child->GetType() == DbType::kEntityInstantiation) {
    label = entity->GetLabel();
    target = ResolveEntityRef(tables, entity->GetEntityName(), entity->GetArchitectureName(), library);
    if (target.IsEmpty()) {
      Port::StringBase entityLibrary;
      Port::StringBase entityName;
      SplitDottedName(entity->GetEntityName(), entityLibrary, entityName);
      const Port::StringBase& text =
          ModeOneEqual(entityLibrary, "work") ? entityName : entity->GetEntityName();
      return Qualify(library, Formatted("Architecture|%s|%s", text, entity->GetArchitectureName()));
    }
  }
  if (!target.IsEmpty()) CountReference(tables, target);
  return target;
}

CitI::Result CElaborator::ProcessInstances(CElabTables& tables, const Port::StringBase& qualified,
                                           DbObject* unit, const Port::StringBase& library) {
  for (DbObject* child : unit->GetChildren()) {
    Port::StringBase label;
    Port::StringBase target = InstanceTarget(tables, child, library, label);
    // Only instances take part: a label without a target would shift every later label against
    // its target.
    if (target.IsEmpty()) continue;
    if (qualified.IsEmpty() || library.IsEmpty()) return CitI::kInvalidArg;
    CitI::Result result = AddDepends(tables, qualified, target);
    if (result == CitI::kOk) result = AddInstanceLabel(tables, qualified, label);
    if (result != CitI::kOk) return result;

    auto* instance = Prjrep::QueryAs<IHdlElement>(child);
    if (!instance) return CitI::kInvalidArg;
    Port::StringBase instanceKey;
    instanceKey.Format("%s|%s|%s", qualified.c_str(), target.c_str(), label.c_str());
    IHdlElement*& stored = tables.m_IHdlElementInstanceNameMap[instanceKey];
    if (!stored) stored = instance;
  }
  return CitI::kOk;
}

CitI::Result CElaborator::ProcessPrimaryUnit(CElabTables& tables, const Port::StringBase& qualified,
                                             DbObject* unit, const Port::StringBase& library) {
  Port::StringBase target;
  if (auto* arch = dynamic_cast<Arch*>(unit)) {
    target = ResolvePrimaryEntity(tables, arch->GetEntityName(), library);
    if (target.IsEmpty())
      target = Qualify(library, Formatted("Entity|%s", arch->GetEntityName()));
    else
      CountReference(tables, target);
  } else if (auto* body = dynamic_cast<PackageBody*>(unit)) {
    target = ResolvePackage(tables, body->GetPackageName(), library);
    if (target.IsEmpty())
      target = Qualify(library, Formatted("PackageDecl|%s", body->GetPackageName()));
    else
      CountReference(tables, target);
  }
  if (target.IsEmpty()) return CitI::kInvalidArg;
  CitI::Result result = AddDepends(tables, qualified, target);
  if (result != CitI::kOk) return result;
  Port::StringBase targetLibrary;
  Port::StringBase targetKey;
  SplitQualifiedName(target, targetLibrary, targetKey);
  return AddInstanceLabel(tables, Qualify(library, targetKey), {});
}

CitI::Result CElaborator::ProcessElement(CElabTables& tables, const Port::StringBase& name,
                                         IHdlElement* element) {
  if (!element) return CitI::kInvalidArg;
  DbObject* unit = DesignObjectOf(element);
  if (!unit) return CitI::kFail;
  Port::StringBase library = LibraryOf(element);
  Port::StringBase qualified = Qualify(library, name);

  if (tables.m_DependsTable.count(qualified))
    Messages(__LINE__)->issueInfo(ElabText::kDuplicateName, name.c_str());

  std::uint32_t type = unit->GetType();
  CitI::Result result = CitI::kOk;
  if (type & ElabMask::kVhdlUnit) result = ProcessUseClauses(tables, qualified, unit, library);
  if (result == CitI::kOk && (type & ElabMask::kContainsInstances))
    result = ProcessInstances(tables, qualified, unit, library);
  if (result == CitI::kOk && (type & ElabMask::kHasPrimaryUnit))
    result = ProcessPrimaryUnit(tables, qualified, unit, library);
  if (result == CitI::kOk && !(type & ElabMask::kKnownUnit))
    result = AddInstanceLabel(tables, qualified, ElabText::kUnknownType);
  return result;
}

// ---- the run -------------------------------------------------------------------------------------

CitI::Result CElaborator::Elaborate(CLibRefs* libraryReferences, IHdlDesignUnitIterator* elements,
                                    IHdlNetListNode** root) {
  Prjrep::AutoOut<IHdlNetListNode> out(root);
  if (!libraryReferences || !elements || out.IsMissing()) return CitI::kInvalidArg;

  CElabTables tables;
  DuplicateList duplicates;
  CitI::Result result = RegisterDesignUnits(tables, elements, duplicates);
  if (result != CitI::kOk) return result;
  for (const auto& [name, element] : tables.m_piHdlElementMultiMapNames) {
    result = ProcessElement(tables, name, element);
    if (result != CitI::kOk) return result;
  }

  Prjrep::AutoPtr<IHdlNetListNode> tree;
  result = CreateNetListNode({}, nullptr, nullptr, tree.Out());
  if (result != CitI::kOk) return result;
  result = BuildHierarchy(tables, libraryReferences, tree.Get());
  if (result == CitI::kOk) result = StripDuplicateSuffixes(duplicates, tree.Get());
  if (result != CitI::kOk) return result;
  Prjrep::QueryAs<IHdlNetListNodeInternal>(tree.Get())->ComputePaths({});
  out.Set(tree.Get());
  return CitI::kOk;
}

namespace {

struct MissingFile {
  IHdlFile* file;
  std::uint64_t orderKey;
  Port::StringBase fullName;
};

bool HasNoDesignUnit(SourceFileLink* file) {
  IHdlDesignUnitSet* units = file->GetUnitSet();
  Prjrep::AutoRelease<IHdlDesignUnitIterator> unit;
  if (!units || units->CreateIterator(unit.Out()) != CitI::kOk || !unit) return true;
  // Library clauses, use clauses and instances alone do not put a file into the hierarchy.
  for (; !unit->IsDone(); unit->Next()) {
    DbObject* object = DesignObjectOf(unit->Current());
    if (object && (object->GetType() & DbType::kDesignUnitKinds)) return false;
  }
  return true;
}

std::vector<MissingFile> FilesWithoutUnits(IHdlFileIterator* files) {
  std::vector<MissingFile> missing;
  for (files->First(); !files->IsDone(); files->Next()) {
    IHdlFile* file = files->Current();
    auto* sourceFile = Prjrep::ObjectCast<SourceFileLink>(file);
    if (!sourceFile) continue;
    Port::StringBase plugin;
    file->getPluginName(&plugin);
    if (plugin != "PLUGIN_Vhdl" && plugin != "PLUGIN_Verilog") continue;
    if (!HasNoDesignUnit(sourceFile)) continue;
    MissingFile entry{file, 0, {}};
    file->getOrderKey(&entry.orderKey);
    sourceFile->GetFullFileName(entry.fullName);
    missing.push_back(std::move(entry));
  }
  // Ascending order key; equal keys by name, so the result does not depend on addresses.
  std::sort(missing.begin(), missing.end(), [](const MissingFile& a, const MissingFile& b) {
    if (a.orderKey != b.orderKey) return a.orderKey < b.orderKey;
    return a.fullName < b.fullName;
  });
  return missing;
}

}  // namespace

CitI::Result CElaborator::AddMissingFileNodes(IHdlNetListNode* root, IHdlFileIterator* files) {
  // Placeholders need a root to stand under; without files there is nothing to add.
  auto* rootInternal = Prjrep::QueryAs<IHdlNetListNodeInternal>(root);
  if (!rootInternal) return CitI::kInvalidArg;
  if (!files) return CitI::kOk;
  for (const MissingFile& entry : FilesWithoutUnits(files)) {
    Prjrep::AutoRelease<CitI::IInterface> unit(new CMissingFileDU(entry.file));
    auto* element = Prjrep::QueryAs<IHdlElement>(unit.Get());
    Port::StringBase name;
    DesignObjectOf(unit.Get())->GetDesignUnitKey(name);
    Prjrep::AutoPtr<IHdlNetListNode> node;
    if (CreateNetListNode(name, element, nullptr, node.Out()) != CitI::kOk) continue;
    rootInternal->AddChildFirst(node.Get());
  }
  return CitI::kOk;
}

// ---- the tree ------------------------------------------------------------------------------------

CitI::Result CElaborator::CreateNetListNode(const Port::StringBase& name, IHdlElement* element,
                                            IHdlNetListNode* parent, IHdlNetListNode** out) {
  Prjrep::AutoOut<IHdlNetListNode> result(out);
  if (result.IsMissing()) return CitI::kInvalidArg;
  auto node = Prjrep::CreateInstanceAs<IHdlNetListNode>(ClassIds::CNetListNode());
  auto* internal = Prjrep::QueryAs<IHdlNetListNodeInternal>(node.Get());
  if (!internal) return CitI::kFail;
  internal->SetElement(element);
  SetNodeNameFields(node.Get(), name);
  if (auto* parentInternal = Prjrep::QueryAs<IHdlNetListNodeInternal>(parent)) {
    CitI::Result linked = parentInternal->AddChild(node.Get());
    if (linked != CitI::kOk) return linked;
  }
  result.Set(node.Get());
  return CitI::kOk;
}

CitI::Result CElaborator::SetNodeNameFields(IHdlNetListNode* node, const Port::StringBase& name) {
  auto* internal = Prjrep::QueryAs<IHdlNetListNodeInternal>(node);
  if (!internal) return CitI::kInvalidArg;
  internal->SetName(name);
  std::vector<Port::StringBase> parts = SplitKeepingEmpty(name, '|');
  internal->SetKind(parts[0]);
  if (parts.size() > 1) internal->SetUnitName(parts[1]);
  if (parts.size() > 2) internal->SetArchitectureName(parts[2]);
  return CitI::kOk;
}

CitI::Result CElaborator::FindElementByKey(const CElabTables& tables, const Port::StringBase& qualifiedKey,
                                           bool exact, IHdlElement** out) const {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  if (qualifiedKey.IsEmpty()) return CitI::kInvalidArg;
  Port::StringBase library;
  Port::StringBase key;
  SplitQualifiedName(qualifiedKey, library, key);
  if (library.IsEmpty()) library = "work";
  IHdlElement* element = FindRegisteredElement(tables, key, library, exact);
  if (element && ModeOneEqual(LibraryOf(element), library)) *out = element;
  return CitI::kOk;
}

namespace {

using NameSet = std::unordered_set<std::string_view>;

// The units that lie on a reference cycle (a strongly connected component of more than one
// unit, or a unit that references itself); only these can reach themselves in the tree.
NameSet UnitsOnCycles(const CElabTables& tables) {
  std::unordered_map<std::string_view, std::size_t> index;
  auto vertexOf = [&index](std::string_view name) {
    return index.try_emplace(name, index.size()).first->second;
  };
  std::vector<std::pair<std::size_t, std::size_t>> edges;
  NameSet cycles;
  for (const auto& [name, targets] : tables.m_DependsTable) {
    std::size_t from = vertexOf(name.view());
    for (const Port::StringBase& target : targets) {
      std::size_t to = vertexOf(target.view());
      if (from == to) cycles.insert(name.view());
      edges.emplace_back(from, to);
    }
  }
  boost::adjacency_list<boost::vecS, boost::vecS, boost::directedS> graph(index.size());
  for (const auto& [from, to] : edges) boost::add_edge(from, to, graph);
  std::vector<std::size_t> component(index.size());
  std::size_t count = boost::strong_components(graph, component.data());
  std::vector<std::size_t> size(count, 0);
  for (std::size_t c : component) ++size[c];
  for (const auto& [name, vertex] : index) {
    if (size[component[vertex]] > 1) cycles.insert(name);
  }
  return cycles;
}

// The units of a marker path "|*a||*b|", top first.
std::vector<std::string> UnitsOfMarkerPath(std::string_view path) {
  std::vector<std::string> units;
  while (path.starts_with("|*")) {
    std::size_t end = path.find("||*", 2);
    if (end == std::string_view::npos) {
      units.emplace_back(path.substr(2, path.size() - 2 - (path.ends_with('|') ? 1 : 0)));
      break;
    }
    units.emplace_back(path.substr(2, end - 2));
    path.remove_prefix(end + 1);
  }
  return units;
}

}  // namespace

// What one hierarchy build keeps between its top nodes.
struct CElaborator::HierarchyBuild {
  CElabTables& tables;
  VisitedMap& visited;
  MissingNodeList& missing;
  bool share;
  NameSet onCycle;
  // The node built for each shared unit (the tree holds it).
  std::unordered_map<std::string_view, IHdlNetListNode*> shared;
  // The units from the top node down to the node being built.
  NameSet chain;
};

// A node whose references are being turned into children.
struct CElaborator::BuildFrame {
  IHdlNetListNode* node;
  const Port::StringBase* name;
  const std::vector<Port::StringBase>* targets;
  const std::vector<Port::StringBase>* labels;
  std::size_t next;
};

CitI::Result CElaborator::BuildHierarchy(CElabTables& tables, CLibRefs* libraryReferences,
                                         IHdlNetListNode* root) {
  if (!root) return CitI::kInvalidArg;
  std::vector<std::pair<Port::StringBase, std::uint32_t>> units(
      tables.m_ElementNameDependencyCountMap.begin(), tables.m_ElementNameDependencyCountMap.end());
  VisitedMap visited;
  for (const auto& unit : units) visited.emplace(unit.first, false);
  // Units that nothing references come first; the map's byte order breaks ties.
  std::stable_sort(units.begin(), units.end(),
                   [](const auto& a, const auto& b) { return a.second < b.second; });

  MissingNodeList missing;
  HierarchyBuild build{tables, visited, missing, shareSubtrees_, UnitsOnCycles(tables), {}, {}};
  for (const auto& [name, count] : units) {
    if (visited[name]) continue;
    IHdlElement* element = nullptr;
    FindElementByKey(tables, name, true, &element);
    Port::StringBase library;
    Port::StringBase key;
    SplitQualifiedName(name, library, key);
    Prjrep::AutoPtr<IHdlNetListNode> node;
    CitI::Result result = CreateNetListNode(key, element, root, node.Out());
    if (result != CitI::kOk) return result;
    result = ExpandSubtree(build, node.Get(), name);
    if (result != CitI::kOk) return result;
  }

  for (CNetListNode* node : missing) {
    bool isLibraryCell = false;
    CitI::Result result = TestLibraryCell(tables, libraryReferences, node->AsNode(), &isLibraryCell);
    if (result != CitI::kOk) return result;
    node->SetLibraryCell(isLibraryCell);
  }
  return CitI::kOk;
}

void CElaborator::AttachInstanceElement(const CElabTables& tables, CNetListNode* child,
                                        const Port::StringBase& instanceKey) {
  auto found = tables.m_IHdlElementInstanceNameMap.find(instanceKey);
  if (found != tables.m_IHdlElementInstanceNameMap.end() && found->second)
    child->SetInstanceElement(found->second);
}

CitI::Result CElaborator::BuildSubtree(CElabTables& tables, VisitedMap& visited, MissingNodeList& missing,
                                       IHdlNetListNode* node, const Port::StringBase& name,
                                       Port::StringBase& path) {
  if (!node) return CitI::kInvalidArg;
  if (!Prjrep::QueryAs<IHdlNetListNodeInternal>(node)) return CitI::kFail;
  HierarchyBuild build{tables, visited, missing, shareSubtrees_, UnitsOnCycles(tables), {}, {}};
  std::vector<std::string> above = UnitsOfMarkerPath(path.view());
  for (const std::string& unit : above) build.chain.insert(unit);
  return ExpandSubtree(build, node, name);
}

bool CElaborator::EnterUnit(HierarchyBuild& build, std::vector<BuildFrame>& frames, IHdlNetListNode* node,
                            const Port::StringBase& name) const {
  build.visited[name] = true;
  if (!build.chain.insert(name.view()).second) {
    Messages(__LINE__)->issueWarning(ElabText::kCircularReference, name.c_str());
    return false;
  }
  frames.push_back({node, &name, FindDepends(build.tables, name), FindInstanceLabels(build.tables, name), 0});
  return true;
}

CitI::Result CElaborator::ExpandSubtree(HierarchyBuild& build, IHdlNetListNode* node,
                                        const Port::StringBase& name) {
  if (!node) return CitI::kInvalidArg;
  if (!Prjrep::QueryAs<IHdlNetListNodeInternal>(node)) return CitI::kFail;
  std::vector<BuildFrame> frames;
  if (!EnterUnit(build, frames, node, name)) return CitI::kFail;
  while (!frames.empty()) {
    const BuildFrame& frame = frames.back();
    if (frame.targets && frame.next < frame.targets->size()) {
      CitI::Result result = AddNextChild(build, frames);
      if (result != CitI::kOk) return result;
      continue;
    }
    build.chain.erase(frame.name->view());
    frames.pop_back();
  }
  return CitI::kOk;
}

CitI::Result CElaborator::AddNextChild(HierarchyBuild& build, std::vector<BuildFrame>& frames) {
  // Taken out before a new frame may move the stack.
  IHdlNetListNode* parent = frames.back().node;
  const Port::StringBase& parentName = *frames.back().name;
  std::size_t index = frames.back().next++;
  const Port::StringBase& target = (*frames.back().targets)[index];
  const std::vector<Port::StringBase>* labels = frames.back().labels;
  const Port::StringBase* label = labels && index < labels->size() ? &(*labels)[index] : nullptr;

  IHdlElement* element = nullptr;
  FindElementByKey(build.tables, target, true, &element);
  // Such a subtree is the same under every parent: no ancestor's unit can occur in it.
  bool shared =
      build.share && element && (!label || label->IsEmpty()) && !build.onCycle.contains(target.view());
  if (shared) {
    auto built = build.shared.find(target.view());
    if (built != build.shared.end()) return CNetListNode::FromInterface(parent)->AddChild(built->second);
  }
  Prjrep::AutoPtr<IHdlNetListNode> childInterface;
  CitI::Result result = CreateNetListNode(target, element, parent, childInterface.Out());
  if (result != CitI::kOk) return result;
  CNetListNode* child = CNetListNode::FromInterface(childInterface.Get());
  if (!element) build.missing.push_back(child);
  if (label) {
    child->SetInstanceName(*label);
    // Keyed by the referring unit's qualified name, as the instances were stored.
    Port::StringBase instanceKey;
    instanceKey.Format("%s|%s|%s", parentName.c_str(), target.c_str(), label->c_str());
    AttachInstanceElement(build.tables, child, instanceKey);
  }
  if (shared) build.shared.emplace(target.view(), childInterface.Get());
  EnterUnit(build, frames, childInterface.Get(), target);
  return CitI::kOk;
}

bool CElaborator::AskCellLibraries(CLibRefs* libraryReferences, const Port::StringBase& cell,
                                   const char* language) const {
  for (const char* library : kCellLibraries) {
    if (libraryReferences->HasLibraryUnit(library, "*", "all", cell, language)) return true;
  }
  return false;
}

bool CElaborator::AskUseClauses(const CElabTables& tables, CLibRefs* libraryReferences, DbObject* unit,
                                const Port::StringBase& cell) const {
  Port::StringBase library = LibraryOf(unit);
  for (Use* use : UsesOf(unit)) {
    UseParts parts = SplitUseClause(*this, tables, *use, library);
    if (libraryReferences->HasLibraryUnit(parts.library, parts.package, parts.item, cell, "VHDL"))
      return true;
  }
  return false;
}

CitI::Result CElaborator::TestLibraryCell(CElabTables& tables, CLibRefs* libraryReferences,
                                          IHdlNetListNode* node, bool* isLibraryCell) {
  if (!isLibraryCell) return CitI::kInvalidArg;
  *isLibraryCell = false;
  CNetListNode* missingNode = CNetListNode::FromInterface(node);
  if (!missingNode) return CitI::kInvalidArg;
  if (!libraryReferences) return CitI::kOk;

  Port::StringBase unitName = missingNode->UnitName();
  unitName.RemoveAll("Architecture|");
  unitName.RemoveAll("|");
  Port::StringBase cellLibrary;
  Port::StringBase cell;
  SplitDottedName(unitName, cellLibrary, cell);
  if (!cellLibrary.IsEmpty()) return CitI::kOk;

  CNetListNode* parent = CNetListNode::FromInterface(missingNode->FirstParent());
  DbObject* parentUnit = parent ? DesignObjectOf(parent->GetElement()) : nullptr;
  if (!parentUnit) return CitI::kOk;
  if (parentUnit->GetType() == DbType::kModule) {
    *isLibraryCell = AskCellLibraries(libraryReferences, cell, "Verilog");
    return CitI::kOk;
  }
  if (parentUnit->GetType() != DbType::kArchitecture) return CitI::kOk;

  if (AskCellLibraries(libraryReferences, cell, "VHDL") ||
      AskUseClauses(tables, libraryReferences, parentUnit, cell)) {
    *isLibraryCell = true;
    return CitI::kOk;
  }
  for (IHdlNetListNode* sibling : parent->Children()) {
    DbObject* siblingUnit = DesignObjectOf(sibling->GetElement());
    if (!siblingUnit || siblingUnit->GetType() != DbType::kEntity) continue;
    *isLibraryCell = AskUseClauses(tables, libraryReferences, siblingUnit, cell);
    break;
  }
  return CitI::kOk;
}

CitI::Result CElaborator::StripDuplicateSuffixes(const DuplicateList& duplicates, IHdlNetListNode* root) {
  CNetListNode* rootNode = CNetListNode::FromInterface(root);
  if (!rootNode) return CitI::kInvalidArg;
  for (IHdlElement* duplicate : duplicates) {
    for (IHdlNetListNode* child : rootNode->Children()) {
      if (!SameObject(child->GetElement(), duplicate)) continue;
      Port::StringBase name = CNetListNode::FromInterface(child)->Name();
      std::size_t start = name.Find(ElabText::kDuplicateStart);
      std::size_t end = name.Find(ElabText::kDuplicateEnd, start == Port::StringBase::npos ? 0 : start);
      if (start == Port::StringBase::npos || end == Port::StringBase::npos) continue;
      end += std::string_view(ElabText::kDuplicateEnd).size();
      Port::StringBase stripped = name.Left(start) + name.Mid(end).view();
      SetNodeNameFields(child, stripped);
    }
  }
  return CitI::kOk;
}

// ---- dumps ---------------------------------------------------------------------------------------

void CElaborator::DumpTables(const CElabTables& tables) const {
  std::printf("\n\n>>> m_sArchitectureMultiMapList <<<\n");
  for (const auto& [key, unit] : tables.m_sArchitectureMultiMapList) {
    std::printf("  %s -- %s\n", key.c_str(), unit.library.c_str());
    for (const Port::StringBase& text : unit.keys) std::printf("   %s\n", text.c_str());
  }
  std::printf("\n\n>>> m_sElementNameInstanceList <<<\n");
  for (const auto& [key, labels] : tables.m_sElementNameInstanceList) {
    std::printf("  %s\n", key.c_str());
    for (const Port::StringBase& label : labels) std::printf("   %s\n", label.c_str());
  }
  std::printf("\n\n>>> m_IHdlElementInstanceNameMap <<<\n");
  for (const auto& [key, element] : tables.m_IHdlElementInstanceNameMap) {
    Port::StringBase partition;
    if (auto* properties = Prjrep::QueryAs<IHdlDUProperties>(element))
      properties->GetProperty("PARTITION", &partition);
    std::printf("  %s, Prop: %s, Ptr: %p\n", key.c_str(), partition.c_str(), static_cast<void*>(element));
  }
  std::printf("\n\n>>> m_ElementNameDependencyCountMap <<<\n");
  for (const auto& [key, count] : tables.m_ElementNameDependencyCountMap)
    std::printf("  %s -- %u\n", key.c_str(), static_cast<unsigned>(count));
  std::printf("\n\n>>> m_DependsTable <<<\n");
  for (const auto& [key, targets] : tables.m_DependsTable) {
    std::printf("  %s\n", key.c_str());
    for (const Port::StringBase& target : targets) std::printf("    %s\n", target.c_str());
  }
  std::printf("\n\n>>> m_piHdlElementMultiMapNames <<<\n");
  for (const auto& [key, element] : tables.m_piHdlElementMultiMapNames)
    std::printf("  %s - %s Ptr: %p\n", LibraryOf(element).c_str(), key.c_str(), static_cast<void*>(element));
}

CitI::Result CElaborator::DumpTree(IHdlNetListNode* node, int depth) const {
  CNetListNode* top = CNetListNode::FromInterface(node);
  if (!top) return CitI::kInvalidArg;
  std::unordered_set<const CNetListNode*> dumped;
  std::vector<std::pair<CNetListNode*, int>> pending{{top, depth}};
  while (!pending.empty()) {
    auto [tree, level] = pending.back();
    pending.pop_back();
    std::string indent;
    for (int i = 0; i < level; ++i) indent += "|  ";
    const char* in = indent.c_str();
    // The separator belongs to the parent's indent, as it stands between the parent's children.
    if (tree != top) std::printf("%s-----------------------------\n", indent.substr(3).c_str());
    std::printf("%sInstance Name    : %s\n", in, tree->InstanceName().c_str());
    std::printf("%sModule Name      : %s\n", in, tree->UnitName().c_str());
    std::printf("%sArchitecture Name: %s\n", in, tree->ArchitectureName().c_str());
    Port::StringBase partition;
    if (tree->GetPartition(partition) == CitI::kOk && !partition.IsEmpty())
      std::printf("%sPartition: %s\n", in, partition.c_str());
    Prjrep::AutoRelease<IHdlFile> file;
    if (tree->GetElement() && tree->GetElement()->GetFile(file.Out()) == CitI::kOk && file) {
      Port::StringBase directory;
      Port::StringBase fileName;
      file->getFileName(&directory, &fileName);
      std::printf("%sFile             : %s%s\n", in, directory.c_str(), fileName.c_str());
    }
    if (tree->HasSeveralParents() && !dumped.insert(tree).second) continue;
    const std::vector<IHdlNetListNode*>& children = tree->Children();
    for (auto child = children.rbegin(); child != children.rend(); ++child) {
      if (CNetListNode* childNode = CNetListNode::FromInterface(*child))
        pending.emplace_back(childNode, level + 1);
    }
  }
  return CitI::kOk;
}

}  // namespace Vad
