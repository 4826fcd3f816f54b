#include "CParserConfigHolder.h"

#include <charconv>
#include <utility>

#include "Arch.h"
#include "CHdlFile.h"
#include "CHdlProject.h"
#include "CLibRefs.h"
#include "CParserConfigBase.h"
#include "CProjectFileList.h"
#include "CVhdlDU.h"
#include "CompInst.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "IFileNameHelper.h"
#include "IHdlFile.h"
#include "Identifiers.h"
#include "Library.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "ParserFactory.h"
#include "Port/InitObjects.h"
#include "Prjrep/TSequenceSetHelper.h"
#include "Use.h"
#include "generic.h"
#include "module.h"

namespace Vad {
namespace {

constexpr const char* kVhdlPlugin = "PLUGIN_Vhdl";
constexpr const char* kPartitionProperty = "PARTITION";
constexpr const char* kDefaultLibrary = "work";
constexpr const char* kAllInstances = "All";
constexpr const char* kTestVectorSuffix = "_TestVector";
// The maker's cell libraries, asked in this order whether a component is one of their cells.
constexpr const char* kCellLibraries[] = {"basecell", "timecell", "blockcell"};

std::vector<DbObject*> AsObjects(const std::vector<Use*>& uses) { return {uses.begin(), uses.end()}; }

}  // namespace

const Port::XUID& CParserConfigHolder::NoneTypeId() {
  static const Port::XUID id{std::string_view("{3087E440-FF92-4feb-A60B-693C478305D8}")};
  return id;
}

const CParserConfigHolder::TypeIds& CParserConfigHolder::DefaultTypeIds() {
  static const TypeIds ids{
      Port::XUID(std::string_view("{15B800DC-CD3B-45f9-B26A-26BFDD3441EF}")),
      Port::XUID(std::string_view("{6DCC6CCB-40B6-4f09-9AB3-C3593438F5B2}")),
      Port::XUID(std::string_view("{AE4C9C94-8BAF-44e7-8443-58AD260CF311}")),
      Port::XUID(std::string_view("{35077F2B-87EA-47ac-834F-8C02E49945F0}")),
      Port::XUID(std::string_view("{98867360-CC87-4033-AB17-973F0CEB374F}")),
      Port::XUID(std::string_view("{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}")),
      Port::XUID(std::string_view("{2391D1AB-9BB0-4a61-A080-3CE4BFE2E116}")),
  };
  return ids;
}

CParserConfigHolder::CParserConfigHolder() {
  SetTypeIds(DefaultTypeIds());
  unitSet_ = Prjrep::TRefdSequenceSetHelper<IHdlDesignUnitSet>::New();
}

CParserConfigHolder::~CParserConfigHolder() { ForgetParseState(); }

CitI::IInterface* CParserConfigHolder::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refs_;
  // The file and the factory reach the holder through IInterface as well as its class.
  if (id == ClassIds::CParserConfigHolder() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

// ---- file and configuration queries --------------------------------------------------------------

void CParserConfigHolder::GetFullPath(Port::StringBase& out) const {
  out.Empty();
  if (file_) file_->GetFullPath(out);
}

void CParserConfigHolder::GetBaseName(Port::StringBase& out) const {
  out.Empty();
  if (file_) file_->GetBaseName(out);
}

void CParserConfigHolder::GetExtension(Port::StringBase& out) const {
  out.Empty();
  if (file_) file_->GetExtension(out);
}

void CParserConfigHolder::GetFileName(Port::StringBase& out) const {
  out.Empty();
  if (file_) file_->GetFileNamePart(out);
}

void CParserConfigHolder::GetPluginName(Port::StringBase& out) const {
  out.Empty();
  if (file_) out = file_->GetPluginName();
}

void CParserConfigHolder::GetLibraryName(Port::StringBase& out) const {
  out = kDefaultLibrary;
  if (file_) file_->GetLibraryName(out);
}

CitI::Result CParserConfigHolder::GetProperty(const Port::StringBase& name, Port::StringBase& value) const {
  value.Empty();
  CParserConfigBase* config = file_ ? file_->GetParserConfig() : nullptr;
  return config ? config->GetPropertyValue(name, value) : CitI::kFail;
}

CLibRefs* CParserConfigHolder::GetLibRefs() const {
  CHdlProject* project = file_ ? file_->GetProjectObject() : nullptr;
  return project ? project->getLibraryReferences() : nullptr;
}

void CParserConfigHolder::SetTypeIds(const TypeIds& ids) {
  typeIds_ = ids;
  for (int slot = 0; slot < kTypeSlotCount; ++slot) typeEnabled_[slot] = typeIds_[slot] != NoneTypeId();
}

std::uint32_t CParserConfigHolder::GetUnitCount() const { return unitSet_ ? unitSet_->GetCount() : 0; }

// ---- recording -----------------------------------------------------------------------------------

void CParserConfigHolder::ResetInstanceState() {
  lastCompInst_ = nullptr;
  lastEntityInst_ = nullptr;
  labelCount_ = 0;
}

void CParserConfigHolder::ResetForNextUnit() {
  generateDepth_ = 0;
  componentBindings_.clear();
  ResetInstanceState();
}

void CParserConfigHolder::ForgetParseState() {
  pendingContext_.clear();
  currentUnit_ = nullptr;
  openContext_ = nullptr;
  lastUnit_ = nullptr;
  ResetInstanceState();
}

CHdlElement* CParserConfigHolder::FindRecorded(const Port::StringBase& key) const {
  auto it = recordedUnits_.find(key);
  return it == recordedUnits_.end() ? nullptr : dynamic_cast<CHdlElement*>(it->second.Get());
}

// A record's own store key.
template <class Record>
static Port::StringBase StoreKeyOf(Record* record) {
  Port::StringBase key;
  record->ComposeStoreKey(key);
  return key;
}

bool CParserConfigHolder::Enter(CHdlElement* record, const Port::StringBase& key, std::uint32_t line,
                                const Port::XUID& type) {
  record->SetFile(file_);
  record->SetTextPosition(line, 0);
  record->SetDesignUnitTypeId(type);
  record->SetKey(key.view());
  return RegisterUnit(key, record);
}

void CParserConfigHolder::TakePendingContext(CHdlElement* unit) {
  if (auto* vhdlUnit = dynamic_cast<CVhdlDU*>(unit)) vhdlUnit->SetUses(AsObjects(pendingContext_));
  pendingContext_.clear();
}

Port::StringBase CParserConfigHolder::DuplicateKey(const Port::StringBase& key, int number) {
  return Port::StringBase().Format("%s-Instance(%d)", key.c_str(), number);
}

// A "-Instance(n)" key that is given up makes n the first number to probe again for its base.
void CParserConfigHolder::FreeDuplicateNumber(const Port::StringBase& key) {
  constexpr std::string_view kMark = "-Instance(";
  std::string_view text = key.view();
  std::size_t mark = text.rfind(kMark);
  if (mark == std::string_view::npos || !text.ends_with(')')) return;
  std::string_view digits = text.substr(mark + kMark.size(), text.size() - mark - kMark.size() - 1);
  int number = 0;
  auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), number);
  if (error != std::errc() || end != digits.data() + digits.size()) return;
  auto next = nextDuplicate_.find(Port::StringBase(text.substr(0, mark)));
  if (next != nextDuplicate_.end() && number < next->second) next->second = number;
}

bool CParserConfigHolder::RegisterUnit(const Port::StringBase& key, CHdlElement* record) {
  if (key.IsEmpty() || !record) return false;
  Port::StringBase freeKey = key;
  if (recordedUnits_.contains(freeKey)) {
    // Probing from the number after the last one given keeps N copies of one name linear.
    int& next = nextDuplicate_.try_emplace(key, 1).first->second;
    for (freeKey = DuplicateKey(key, next); recordedUnits_.contains(freeKey);
         freeKey = DuplicateKey(key, ++next)) {
    }
    ++next;
  }
  recordedUnits_.emplace(std::move(freeKey), Prjrep::AutoPtr<CitI::IInterface>(record));
  return true;
}

Library* CParserConfigHolder::AddLibrary(const Port::StringBase& name, std::uint32_t line,
                                         const Port::XUID& type) {
  ResetForNextUnit();
  // Library clauses inside a context declaration belong to it.
  if (!openContext_ || currentUnit_ != openContext_) currentUnit_ = nullptr;
  // A repeated clause finds its record by key before a new one is made.
  Port::StringBase key;
  Library::ComposeStoreKeyFor(name.view(), key);
  if (auto* existing = dynamic_cast<Library*>(FindRecorded(key))) return existing;
  Prjrep::AutoRelease<Library> library(new Library(name.view(), nullptr));
  return Enter(library.Get(), key, line, type) ? library.Get() : nullptr;
}

Use* CParserConfigHolder::RecordUse(const Port::StringBase& dottedName, std::uint32_t line,
                                    const Port::XUID& type) {
  Port::StringBase key;
  Use::ComposeStoreKeyFor(dottedName.view(), key);
  if (auto* existing = dynamic_cast<Use*>(FindRecorded(key))) return existing;
  Prjrep::AutoRelease<Use> use(new Use(dottedName.view(), nullptr));
  return Enter(use.Get(), key, line, type) ? use.Get() : nullptr;
}

namespace {

void AppendUse(CHdlElement* unit, Use* use) {
  auto* vhdlUnit = dynamic_cast<CVhdlDU*>(unit);
  if (!vhdlUnit) return;
  std::vector<DbObject*> uses;
  vhdlUnit->GetUses(uses);
  uses.push_back(use);
  vhdlUnit->SetUses(uses);
}

}  // namespace

Use* CParserConfigHolder::AddUse(const Port::StringBase& dottedName, std::uint32_t line,
                                 const Port::XUID& type, bool inBody) {
  ResetForNextUnit();
  Use* use = RecordUse(dottedName, line, type);
  if (use) AttachUse(use, inBody);
  return use;
}

void CParserConfigHolder::AttachUse(Use* use, bool inBody) {
  if (currentUnit_ && (!inBody || currentUnit_ == openContext_)) {
    AppendUse(currentUnit_, use);
    return;
  }
  pendingContext_.push_back(use);
  currentUnit_ = nullptr;
}

Use* CParserConfigHolder::AddUnitUse(const Port::StringBase& dottedName, std::uint32_t line,
                                     const Port::XUID& type) {
  Use* use = RecordUse(dottedName, line, type);
  if (!use) return nullptr;
  if (lastUnit_) {
    AppendUse(lastUnit_, use);
  } else {
    pendingContext_.push_back(use);
  }
  return use;
}

PackageDecl* CParserConfigHolder::AddContextDecl(const Port::StringBase& name, std::uint32_t line,
                                                 const Port::XUID& type) {
  PackageDecl* context = AddPackageDecl(name, line, type);
  currentUnit_ = context;
  openContext_ = context;
  return context;
}

PackageDecl* CParserConfigHolder::AddConfigurationDecl(const Port::StringBase& name, std::uint32_t line,
                                                       const Port::XUID& type) {
  PackageDecl* configuration = AddPackageDecl(name, line, type);
  currentUnit_ = configuration;
  return configuration;
}

PackageDecl* CParserConfigHolder::AddPackageInstance(const Port::StringBase& name,
                                                     const Port::StringBase& genericPackage,
                                                     std::uint32_t line, const Port::XUID& packageType,
                                                     const Port::XUID& useType) {
  PackageDecl* package = AddPackageDecl(name, line, packageType);
  if (package) AddUnitUse(genericPackage, line, useType);
  return package;
}

void CParserConfigHolder::EndDeclaration() {
  currentUnit_ = nullptr;
  openContext_ = nullptr;
}

EntityDecl* CParserConfigHolder::AddEntityDecl(const Port::StringBase& name, std::uint32_t line,
                                               bool portFlag, const Port::XUID& type) {
  ResetForNextUnit();
  if (!IsEnabled(kEntitySlot)) return nullptr;
  Prjrep::AutoRelease<EntityDecl> entity(new EntityDecl(name.view(), nullptr));
  entity->SetUnitFlag(portFlag);
  if (!Enter(entity.Get(), StoreKeyOf(entity.Get()), line, type)) return nullptr;
  TakePendingContext(entity.Get());
  currentUnit_ = entity.Get();
  lastUnit_ = entity.Get();
  return entity.Get();
}

Arch* CParserConfigHolder::AddArch(const Port::StringBase& archName, const Port::StringBase& entityName,
                                   std::uint32_t line, const Port::XUID& type) {
  ResetForNextUnit();
  if (!IsEnabled(kArchitectureSlot)) return nullptr;
  Prjrep::AutoRelease<Arch> architecture(new Arch(entityName.view(), archName.view(), nullptr));
  if (!Enter(architecture.Get(), StoreKeyOf(architecture.Get()), line, type)) return nullptr;
  TakePendingContext(architecture.Get());
  currentUnit_ = architecture.Get();
  lastUnit_ = architecture.Get();
  return architecture.Get();
}

module* CParserConfigHolder::AddModule(const Port::StringBase& name, std::uint32_t line, bool flag,
                                       const Port::XUID& type, const Port::StringBase& partition) {
  if (!IsEnabled(kModuleSlot)) return nullptr;
  ResetForNextUnit();
  Prjrep::AutoRelease<module> unit(new module(name.view(), nullptr));
  unit->SetUnitFlag(flag);
  if (!partition.IsEmpty()) unit->SetProperty(kPartitionProperty, partition);
  if (!Enter(unit.Get(), StoreKeyOf(unit.Get()), line, type)) return nullptr;
  pendingContext_.clear();
  currentUnit_ = unit.Get();
  lastUnit_ = unit.Get();
  return unit.Get();
}

PackageBody* CParserConfigHolder::AddPackageBody(const Port::StringBase& name, std::uint32_t line,
                                                 const Port::XUID& type) {
  ResetForNextUnit();
  if (!IsEnabled(kPackageBodySlot)) return nullptr;
  Prjrep::AutoRelease<PackageBody> body(new PackageBody(name.view(), nullptr));
  if (!Enter(body.Get(), StoreKeyOf(body.Get()), line, type)) return nullptr;
  TakePendingContext(body.Get());
  currentUnit_ = nullptr;
  lastUnit_ = body.Get();
  return body.Get();
}

PackageDecl* CParserConfigHolder::AddPackageDecl(const Port::StringBase& name, std::uint32_t line,
                                                 const Port::XUID& type) {
  ResetForNextUnit();
  if (!IsEnabled(kPackageDeclSlot)) return nullptr;
  Prjrep::AutoRelease<PackageDecl> package(new PackageDecl(name.view(), nullptr));
  if (!Enter(package.Get(), StoreKeyOf(package.Get()), line, type)) return nullptr;
  TakePendingContext(package.Get());
  currentUnit_ = nullptr;
  lastUnit_ = package.Get();
  return package.Get();
}

generic* CParserConfigHolder::AddGeneric(const Port::StringBase& name, std::uint32_t line,
                                         const Port::XUID& type) {
  ResetForNextUnit();
  Prjrep::AutoRelease<generic> unit(new generic(name.view(), nullptr));
  return Enter(unit.Get(), StoreKeyOf(unit.Get()), line, type) ? unit.Get() : nullptr;
}

bool CParserConfigHolder::IsLibraryCell(const Port::StringBase& component) const {
  CLibRefs* libraryReferences = GetLibRefs();
  if (!libraryReferences) return false;
  for (const char* library : kCellLibraries) {
    if (libraryReferences->HasLibraryUnit(library, "vcomponents", "all", component, "Verilog")) return true;
  }
  return false;
}

CompInst* CParserConfigHolder::AddCompInst(const Port::StringBase& label, const Port::StringBase& component,
                                           std::uint32_t line, const Port::XUID& type,
                                           const Port::StringBase& partition) {
  Port::StringBase pluginName;
  GetPluginName(pluginName);
  if (pluginName == kVhdlPlugin) {
    auto binding = componentBindings_.find(component);
    if (binding != componentBindings_.end() && !binding->second.IsEmpty()) {
      Port::StringBase entity = binding->second;
      AddEntityInst(label, entity, Port::StringBase(), line, type);
      return nullptr;
    }
  }
  if (IsLibraryCell(component)) {
    ResetInstanceState();
    return nullptr;
  }
  pendingContext_.clear();
  labelCount_ = 0;
  if (!currentUnit_) return nullptr;
  Prjrep::AutoRelease<CompInst> instance(
      new CompInst(label.IsEmpty() ? component.view() : label.view(), component.view(), currentUnit_));
  instance->SetInGenerate(generateDepth_ != 0);
  if (!partition.IsEmpty()) instance->SetProperty(kPartitionProperty, partition);
  if (!Enter(instance.Get(), StoreKeyOf(instance.Get()), line, type)) return nullptr;
  lastCompInst_ = instance.Get();
  lastEntityInst_ = nullptr;
  return instance.Get();
}

EntityInst* CParserConfigHolder::AddEntityInst(const Port::StringBase& label, const Port::StringBase& entity,
                                               const Port::StringBase& architecture, std::uint32_t line,
                                               const Port::XUID& type) {
  if (!currentUnit_) return nullptr;
  Prjrep::AutoRelease<EntityInst> instance(new EntityInst(label.view(), currentUnit_));
  instance->SetLabel(label.view());
  instance->SetEntityName(entity.view());
  instance->SetArchitectureName(architecture.view());
  instance->SetInGenerate(generateDepth_ != 0);
  if (!Enter(instance.Get(), StoreKeyOf(instance.Get()), line, type)) return nullptr;
  lastEntityInst_ = instance.Get();
  lastCompInst_ = nullptr;
  // A new instance starts its own labels.
  labelCount_ = 0;
  return instance.Get();
}

void CParserConfigHolder::AddInstanceLabel(const Port::StringBase& label) {
  if (!IsEnabled(kInstanceLabelSlot)) return;
  CHdlElement* lastInstance = lastEntityInst_ ? static_cast<CHdlElement*>(lastEntityInst_) : lastCompInst_;
  if (!lastInstance) return;
  if (labelCount_ == 0) {
    RenameInstance(lastInstance, label);
  } else {
    CopyInstance(label);
  }
  // Counted after the copy, which starts a count of its own: every further label copies again.
  ++labelCount_;
}

void CParserConfigHolder::RenameInstance(CHdlElement* instance, const Port::StringBase& label) {
  Prjrep::AutoPtr<CitI::IInterface> keepAlive(instance);
  // By identity: a duplicate is registered under a "-Instance(n)" key, not under its own.
  for (auto it = recordedUnits_.begin(); it != recordedUnits_.end(); ++it) {
    if (it->second.Get() == static_cast<CitI::IInterface*>(instance)) {
      FreeDuplicateNumber(it->first);
      recordedUnits_.erase(it);
      break;
    }
  }
  Port::StringBase key;
  if (auto* componentInstance = dynamic_cast<CompInst*>(instance)) {
    componentInstance->SetLabel(label.view());
    componentInstance->ComposeStoreKey(key);
  } else if (auto* entityInstance = dynamic_cast<EntityInst*>(instance)) {
    entityInstance->SetLabel(label.view());
    entityInstance->ComposeStoreKey(key);
  }
  RegisterUnit(key, instance);
}

void CParserConfigHolder::CopyInstance(const Port::StringBase& label) {
  if (EntityInst* original = lastEntityInst_) {
    Port::StringBase entity = original->GetEntityName();
    Port::StringBase architecture = original->GetArchitectureName();
    AddEntityInst(label, entity, architecture, original->GetLine(), original->GetDesignUnitTypeId());
  } else if (CompInst* original = lastCompInst_) {
    Port::StringBase component = original->GetComponentName();
    Port::XUID type = original->GetDesignUnitTypeId();
    AddCompInst(label, component, original->GetLine(), type, Port::StringBase());
  }
}

void CParserConfigHolder::AddTestVector(const Port::StringBase& name) {
  if (!IsEnabled(kTestVectorSlot)) return;
  Port::StringBase moduleName = name;
  moduleName.Append(kTestVectorSuffix);
  Prjrep::AutoRelease<module> vectorModule(new module(moduleName.view(), nullptr));
  Port::StringBase prefix;
  vectorModule->AppendKeyPrefix(prefix);
  Port::StringBase key;
  DbObject::JoinKeyFields(key, {prefix.view(), name.view()});
  if (!Enter(vectorModule.Get(), key, 0, typeIds_[kTestVectorSlot])) return;

  Prjrep::AutoRelease<CompInst> instance(new CompInst(name.view(), name.view(), vectorModule.Get()));
  Port::StringBase instanceKey;
  instance->ComposeStoreKey(instanceKey);
  Enter(instance.Get(), instanceKey, 0, typeIds_[kInstanceLabelSlot]);

  if (currentUnit_) currentUnit_->SetUnitFlag(true);
  ResetInstanceState();
}

void CParserConfigHolder::AddConfigBinding(const Port::StringBase& instances,
                                           const Port::StringBase& component, const Port::StringBase& entity,
                                           const Port::StringBase& architecture) {
  if (!instances.Equals(kAllInstances, Port::kCompareNoCase) || !architecture.IsEmpty()) return;
  componentBindings_[component] = entity;
}

void CParserConfigHolder::EnterGenerate() { ++generateDepth_; }

void CParserConfigHolder::LeaveGenerate(bool reset) {
  if (reset || generateDepth_ <= 0) {
    generateDepth_ = 0;
  } else {
    --generateDepth_;
  }
}

void CParserConfigHolder::SetEntityPortFlag(bool flag) {
  if (auto* entity = dynamic_cast<EntityDecl*>(currentUnit_)) entity->SetUnitFlag(flag);
}

// ---- the parse run -------------------------------------------------------------------------------

void CParserConfigHolder::InstallParserFactory(const ParserFactory* factory) { parserFactory_ = factory; }

void CParserConfigHolder::ExtractPorts(IHdlDesignUnit* unit, IHdlPortIterator** out) {
  if (parserFactory_) parserFactory_->ExtractPorts(*this, unit, out);
}

const SiblingPaths& CParserConfigHolder::GetSiblingPaths() const {
  static const SiblingPaths kNone;
  return siblingPaths_ ? *siblingPaths_ : kNone;
}

std::shared_ptr<const SiblingPaths> CParserConfigHolder::SiblingPathsOf(
    IHdlFileIterator* projectFiles) const {
  Port::StringBase pluginName;
  GetPluginName(pluginName);
  if (auto* shared = dynamic_cast<CProjectFileList*>(projectFiles)) return shared->PathsOfPlugin(pluginName);
  return SiblingPaths::Shared(CollectPathsOfPlugin(projectFiles, pluginName));
}

void CParserConfigHolder::BeginParse(IHdlFileIterator* projectFiles) {
  std::map<Port::StringBase, Prjrep::AutoPtr<CitI::IInterface>> released;
  released.swap(recordedUnits_);
  nextDuplicate_.clear();
  ForgetParseState();
  ResetForNextUnit();
  siblingPaths_ = SiblingPathsOf(projectFiles);
}

void CParserConfigHolder::EndParse() {
  unitSet_->Clear();
  for (const auto& [key, record] : recordedUnits_)
    unitSet_->Add(Prjrep::QueryAs<IHdlDesignUnit>(record.Get()));
  std::map<Port::StringBase, Prjrep::AutoPtr<CitI::IInterface>> released;
  released.swap(recordedUnits_);
  nextDuplicate_.clear();
  ForgetParseState();
  TakeParseInputs();
}

void CParserConfigHolder::TakeParseInputs() {
  CParserConfigBase* config = file_ ? file_->GetParserConfig() : nullptr;
  if (!config) return;
  config->GetSignature(signature_);
  GetLibraryName(library_);
}

void CParserConfigHolder::AdoptUnits(const std::vector<Prjrep::AutoPtr<CitI::IInterface>>& records,
                                     IHdlFileIterator* projectFiles) {
  BeginParse(projectFiles);
  unitSet_->Clear();
  for (const Prjrep::AutoPtr<CitI::IInterface>& record : records) {
    if (auto* element = Prjrep::ImplementationCast<CHdlElement>(record.Get())) element->SetFile(file_);
    unitSet_->Add(Prjrep::QueryAs<IHdlDesignUnit>(record.Get()));
  }
  TakeParseInputs();
}

CitI::Result CParserConfigHolder::Parse(IHdlFileIterator* projectFiles) {
  BeginParse(projectFiles);
  if (!parserFactory_ || !parserFactory_->Parse(*this)) return CitI::kFail;
  EndParse();
  return CitI::kOk;
}

CitI::Result CParserConfigHolder::IsUpToDate(bool* valid, IHdlFileIterator* projectFiles) const {
  if (!valid) return CitI::kInvalidArg;
  *valid = false;
  CParserConfigBase* config = file_ ? file_->GetParserConfig() : nullptr;
  if (!config) return CitI::kOk;
  Port::StringBase signature;
  config->GetSignature(signature);
  if (signature != signature_) return CitI::kOk;
  Port::StringBase library;
  GetLibraryName(library);
  if (library != library_) return CitI::kOk;
  const std::vector<Port::StringBase>& stored = GetSiblingPaths().Paths();
  if (!projectFiles) {
    *valid = stored.empty();
    return CitI::kOk;
  }
  std::shared_ptr<const SiblingPaths> current = SiblingPathsOf(projectFiles);
  if (current == siblingPaths_) {
    *valid = true;
    return CitI::kOk;
  }
  if (current->Paths().size() != stored.size()) return CitI::kOk;
  for (std::size_t i = 0; i < stored.size(); ++i) {
    if (!current->Paths()[i].Equals(stored[i].view(), Port::kCompareNoCase)) return CitI::kOk;
  }
  *valid = true;
  return CitI::kOk;
}

}  // namespace Vad
