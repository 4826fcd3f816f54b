#include "CHdlProject.h"

#include <algorithm>
#include <new>

#include "CCompileOrder.h"
#include "CElaborator.h"
#include "CHdlElement.h"
#include "CHdlFile.h"
#include "CLibRefs.h"
#include "CParserConfigBase.h"
#include "CProjectFileList.h"
#include "DbObject.h"
#include "IHdlNetListNode.h"
#include "NetListWalk.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "Prjrep/Casts.h"
#include "Prjrep/TListIter.h"
#include "Prjrep/TSequenceSetHelper.h"

namespace Vad {
namespace {

constexpr const char* kMessageCategory = "ProjectMgmt";
constexpr const char* kMessageSource = "../src/CHdlProject";
constexpr const char* kRevision = "1.1";

constexpr const char* kUndefinedInstancesText =
    "Not Defined:  Vad::CHdlVie::CHdlView_IHdlElaborationData::getUndefinedInstances\n";
constexpr const char* kNoParserConfigText =
    "Error: CHdlProject::XIHdlProject::getNewParserConfig - Unable to create a parser config.\n";
constexpr const char* kNoNewFileText = "Error: CHdlProject::createNewFile - Unable to create a new file.\n";

constexpr const char* kVerilogPlugin = "PLUGIN_Verilog";
// The configuration property naming the device family whose cell libraries apply.
constexpr const char* kFamilyProperty = "PROP_DevFamilyPMName";

// Set while a hierarchy rebuild runs anywhere in the process, so that a request made from inside
// it does not start another.
bool hierarchyRebuildInProgress = false;

class RebuildScope {
 public:
  RebuildScope() { hierarchyRebuildInProgress = true; }
  ~RebuildScope() { hierarchyRebuildInProgress = false; }
  RebuildScope(const RebuildScope&) = delete;
  RebuildScope& operator=(const RebuildScope&) = delete;
};

bool IsVerilogPlugin(const Port::StringBase& pluginName) {
  return pluginName.Equals(kVerilogPlugin, Port::kCompareNoCase);
}

template <class Visit>
void ForEachUnit(IHdlDesignUnitSet* units, Visit visit) {
  Prjrep::AutoRelease<IHdlDesignUnitIterator> unit;
  if (!units || units->CreateIterator(unit.Out()) != CitI::kOk || !unit) return;
  for (; !unit->IsDone(); unit->Next()) visit(unit->Current());
}

bool IsDesignUnitKind(IHdlDesignUnit* unit) {
  auto* object = Prjrep::ImplementationCast<DbObject>(unit);
  return object && (object->GetType() & DbType::kDesignUnitKinds);
}

constexpr const char* kNoElementText =
    "Error: CHdlView::getCompileOrderByDU() - Unable to obtain the CHdlElement pointer.\n";
// getCompileOrderByDU's answers besides 1 and 0.
constexpr CitI::Result kNotOrderedByKind = 4;
constexpr CitI::Result kUnitNotInTree = 5;

// The node of `unit` in the tree: the root itself, else the first match among the children of
// the nodes taken from a stack (the most recently added node first, its children in order).
IHdlNetListNode* FindUnitNode(IHdlNetListNode* root, CitI::IInterface* unit) {
  CitI::IInterface* wanted = NetListWalk::Identity(unit);
  if (!root || !wanted) return nullptr;
  if (NetListWalk::Identity(root->GetElement()) == wanted) return root;
  std::vector<IHdlNetListNode*> pending{root};
  while (!pending.empty()) {
    IHdlNetListNode* node = pending.back();
    pending.pop_back();
    for (IHdlNetListNode* child : NetListWalk::ChildrenOf(node)) {
      if (NetListWalk::Identity(child->GetElement()) == wanted) return child;
      pending.push_back(child);
    }
  }
  return nullptr;
}

IHdlNetListNode* FirstEntityChild(IHdlNetListNode* node) {
  for (IHdlNetListNode* child : NetListWalk::ChildrenOf(node)) {
    auto* object = Prjrep::ImplementationCast<DbObject>(child->GetElement());
    if (object && object->GetType() == DbType::kEntity) return child;
  }
  return nullptr;
}

// An iterator over the one source file of `unit` (none when the unit has no file).
Prjrep::AutoRelease<IHdlFileIterator> IterateOwnFile(CHdlElement* unit) {
  Prjrep::AutoPtr<IHdlFile> file;
  if (auto* element = Prjrep::QueryAs<IHdlElement>(unit)) element->GetSourceFile(file.Out());
  std::vector<IHdlFile*> files;
  if (file) files.push_back(file.Get());
  return Prjrep::TInterfaceListIter<IHdlFileIterator>::New(files);
}

}  // namespace

CHdlProject::CHdlProject()
    : parserConfig_(Prjrep::AutoRelease<CitI::IInterface>(new CParserConfigBase()).Get()) {
  // Iterators over the file table keep the project alive, not just the table.
  files_.SetOwner(this);
}

CHdlProject::~CHdlProject() { UnlinkAll(); }

CitI::IInterface* CHdlProject::QueryInterface(const Port::XUID& id) {
  if (id == IHdlFileSet::Iid()) return &fileSetFace_;
  if (id == IHdlProject::Iid()) return &projectFace_;
  if (id == Prjrep::IRefCount::Iid()) return &refs_;
  if (id == IHdlElaborationData::Iid()) return &elaborationDataFace_;
  if (id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

// ---- for the rest of the module ------------------------------------------------------------------

CitI::Result CHdlProject::getElaborator(CElaborator** out) {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  if (!elaborator_) elaborator_.Attach(new (std::nothrow) CElaborator());
  if (!elaborator_) return CitI::kFail;
  return elaborator_.CopyTo(out);
}

CLibRefs* CHdlProject::getLibraryReferences() {
  if (!libraryReferences_) libraryReferences_.Attach(new CLibRefs());
  CLibRefs* libraryReferences = libraryReferences_.Get();
  if (CParserConfigBase* config = GetParserConfigObject()) {
    Port::StringBase family;
    config->GetPropertyValue(kFamilyProperty, family);
    libraryReferences->LoadLibraries(family);
  }
  return libraryReferences;
}

CParserConfigBase* CHdlProject::GetParserConfigObject() const {
  return Prjrep::ObjectCast<CParserConfigBase>(parserConfig_.Get());
}

// ---- IHdlProject ---------------------------------------------------------------------------------

CHdlProject::VerilogSurvey CHdlProject::SurveyVerilogFiles() const {
  struct Entry {
    IHdlFile* file;
    std::uint64_t orderKey;
  };
  std::vector<Entry> verilog;
  VerilogSurvey survey;
  for (const auto& [key, file] : files_.Elements()) {
    bool v3 = false;
    auto* v3Face = Prjrep::QueryAs<IHdlFileV3>(file);
    if (!v3Face || v3Face->getV3Flag(&v3) != CitI::kOk || !v3) continue;
    Port::StringBase pluginName;
    file->getPluginName(&pluginName);
    if (!IsVerilogPlugin(pluginName)) continue;
    std::uint64_t orderKey = 0;
    bool needsParse = false;
    file->getOrderKey(&orderKey);
    file->getNeedsParse(&needsParse);
    verilog.push_back({file, orderKey});
    survey.changed = survey.changed || needsParse;
  }
  // Equal order keys keep the file-key order, so the list does not depend on addresses.
  std::stable_sort(verilog.begin(), verilog.end(),
                   [](const Entry& a, const Entry& b) { return a.orderKey > b.orderKey; });
  for (const Entry& entry : verilog) survey.files.push_back(entry.file);
  return survey;
}

Prjrep::AutoRelease<IHdlFileIterator> CHdlProject::CurrentFileList(const Port::StringBase& pluginName) const {
  // Only Verilog files read the others; surveying the project for every other file loaded would
  // make loading a project quadratic.
  if (!IsVerilogPlugin(pluginName)) return {};
  return CProjectFileList::New(SurveyVerilogFiles().files);
}

CitI::Result CHdlProject::getAllDesignUnits(IHdlDesignUnitSet** out) {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  VerilogSurvey survey = SurveyVerilogFiles();
  auto projectFiles = CProjectFileList::New(survey.files);

  std::uint32_t total = 0;
  for (const auto& [key, file] : files_.Elements()) {
    auto* hdlFile = Prjrep::ObjectCast<CHdlFile>(file);
    if (!hdlFile) continue;
    // One changed Verilog file can change what every other one means.
    if (survey.changed && IsVerilogPlugin(hdlFile->GetPluginName())) hdlFile->SetNeedsParse(true);
    hdlFile->bringUpToDate(projectFiles.Get());
    std::uint32_t count = 0;
    hdlFile->getDesignUnitCount(&count);
    total += count;
  }

  auto units = Prjrep::TRefdSequenceSetHelper<IHdlDesignUnitSet>::New();
  if (auto* sequence = dynamic_cast<Prjrep::TSequenceSetHelper<IHdlDesignUnitSet>*>(units.Get()))
    sequence->Reserve(total);
  for (const auto& [key, file] : files_.Elements()) {
    auto* hdlFile = Prjrep::ObjectCast<CHdlFile>(file);
    if (!hdlFile) continue;
    ForEachUnit(hdlFile->GetUnitSet(), [&](IHdlDesignUnit* unit) {
      if (IsDesignUnitKind(unit)) units->Add(unit);
    });
  }
  *out = units.Detach();
  return CitI::kOk;
}

CitI::Result CHdlProject::getNewParserConfig(IHdlParserConfig** out) {
  Prjrep::AutoOut<IHdlParserConfig> config(out);
  if (config.IsMissing()) return CitI::kInvalidArg;
  auto* created = new (std::nothrow) CParserConfigBase();
  if (!created) {
    Port_MsgManData::debugStub("%s", kNoParserConfigText);
    return CitI::kFail;
  }
  Prjrep::AutoRelease<CitI::IInterface> owned(created);
  config.Set(Prjrep::QueryAs<IHdlParserConfig>(owned.Get()));
  return CitI::kOk;
}

CitI::Result CHdlProject::createNewFile(IHdlFile** out) {
  Prjrep::AutoOut<IHdlFile> file(out);
  if (file.IsMissing()) return CitI::kInvalidArg;
  auto* created = new (std::nothrow) CHdlFile();
  if (!created) {
    Port_MsgManData::debugStub("%s", kNoNewFileText);
    return CitI::kFail;
  }
  Prjrep::AutoRelease<CitI::IInterface> owned(created);
  file.Set(Prjrep::QueryAs<IHdlFile>(owned.Get()));
  return CitI::kOk;
}

CitI::Result CHdlProject::getParserConfig(IHdlParserConfig** out) { return parserConfig_.CopyTo(out); }

CitI::Result CHdlProject::XIHdlProject::Reserved7(CitI::IInterface** out) {
  if (out) *out = nullptr;
  return CitI::kNotImpl;
}

// ---- IHdlFileSet ---------------------------------------------------------------------------------

Port::StringBase CHdlProject::KeyOf(IHdlFile* file) {
  Port::StringBase directory;
  Port::StringBase fileName;
  file->getFileName(&directory, &fileName);
  directory.Append(fileName.view());
  return directory;
}

void CHdlProject::Unlink(IHdlFile* file) {
  auto* hdlFile = Prjrep::ObjectCast<CHdlFile>(file);
  if (!hdlFile || hdlFile->GetProjectObject() != this) return;
  for (const auto& entry : files_.Elements()) {
    if (entry.second == file) return;  // still filed here under another key
  }
  hdlFile->SetProject(nullptr);
}

void CHdlProject::UnlinkAll() {
  for (const auto& [key, file] : files_.Elements()) {
    auto* hdlFile = Prjrep::ObjectCast<CHdlFile>(file);
    if (hdlFile && hdlFile->GetProjectObject() == this) hdlFile->SetProject(nullptr);
  }
}

CitI::Result CHdlProject::AddFile(IHdlFile* file) {
  if (!file) return CitI::kOk;
  Port::StringBase key = KeyOf(file);
  if (auto* hdlFile = Prjrep::ObjectCast<CHdlFile>(file)) hdlFile->SetProject(this);
  Prjrep::AutoPtr<IHdlFile> replaced(files_.Find(key));
  files_.Insert(key, file);
  if (replaced && replaced.Get() != file) Unlink(replaced.Get());
  ForgetHierarchy();
  return CitI::kOk;
}

CitI::Result CHdlProject::RemoveFile(IHdlFileIterator* position) {
  if (!position || position->IsDone() || !position->Current()) return CitI::kOk;
  Port::StringBase key = KeyOf(position->Current());
  position->Next();
  Prjrep::AutoPtr<IHdlFile> removed(files_.Find(key));
  if (removed && files_.Erase(key)) {
    Unlink(removed.Get());
    ForgetHierarchy();
  }
  return CitI::kOk;
}

CitI::Result CHdlProject::ClearFiles() {
  UnlinkAll();
  return files_.Clear();
}

CitI::Result CHdlProject::XIHdlFileSet::CreateIterator(IHdlFileIterator** out) {
  return owner()->files_.CreateIterator(out);
}

std::uint32_t CHdlProject::XIHdlFileSet::GetCount() { return owner()->files_.GetCount(); }

// ---- IHdlElaborationData -------------------------------------------------------------------------

CitI::Result CHdlProject::getUndefinedInstances() {
  Port_MsgManData::createObject(kMessageCategory, kMessageSource, __LINE__, kRevision)
      ->issueError("%s", kUndefinedInstancesText);
  return CitI::kFail;
}

CitI::Result CHdlProject::getCompileOrder(IHdlNetListNode* top, IHdlFileIterator** out) {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  Prjrep::AutoRelease<IHdlNetListNode> root;
  CitI::Result status = getHierarchyRoot(root.Out());
  if (status != CitI::kOk) return status;
  Prjrep::AutoRelease<CElaborator> elaborator;
  status = getElaborator(elaborator.Out());
  if (status != CitI::kOk) return status;
  return CCompileOrder::OrderBelow(*elaborator.Get(), getLibraryReferences(), root.Get(), top,
                                   parserConfig_.Get(), true, out);
}

CitI::Result CHdlProject::getCompileOrderByDU(IHdlDesignUnit* unit, bool byUnit, IHdlFileIterator** out) {
  if (!unit || !out) return CitI::kFail;
  *out = nullptr;
  Prjrep::AutoRelease<CElaborator> elaborator;
  if (getElaborator(elaborator.Out()) != CitI::kOk || !elaborator) return CitI::kFail;
  auto* element = Prjrep::ImplementationCast<CHdlElement>(unit);
  if (!element) {
    Port_MsgManData::debugStub("%s", kNoElementText);
    return CitI::kFail;
  }
  Prjrep::AutoRelease<IHdlNetListNode> root;
  CitI::Result status = getHierarchyRoot(root.Out());
  if (status != CitI::kOk) return status;
  IHdlNetListNode* node = FindUnitNode(root.Get(), element);
  if (!node) return kUnitNotInTree;

  CLibRefs* references = getLibraryReferences();
  IHdlParserConfig* config = parserConfig_.Get();
  if (!byUnit)
    return CCompileOrder::OrderBelow(*elaborator.Get(), references, root.Get(), node, config, true, out);
  switch (element->GetType()) {
    case DbType::kModule:
      *out = IterateOwnFile(element).Detach();
      return CitI::kOk;
    case DbType::kEntity:
      return CCompileOrder::OrderBelow(*elaborator.Get(), references, root.Get(), root.Get(), config, false,
                                       out);
    case DbType::kArchitecture: {
      IHdlNetListNode* entity = FirstEntityChild(node);
      if (!entity) return kUnitNotInTree;
      return CCompileOrder::OrderBelow(*elaborator.Get(), references, root.Get(), entity, config, false, out);
    }
    default:
      return kNotOrderedByKind;
  }
}

CitI::Result CHdlProject::getDesignUnitPorts(IHdlDesignUnit* unit, IHdlPortIterator** out) {
  auto* element = Prjrep::ImplementationCast<CHdlElement>(unit);
  if (!out || !element) return CitI::kInvalidArg;
  return element->GetPorts(out);
}

bool CHdlProject::IsHierarchyUpToDate() {
  if (!cachedRoot_) return false;
  VerilogSurvey survey = SurveyVerilogFiles();
  if (survey.changed) return false;
  auto projectFiles = CProjectFileList::New(survey.files);
  for (const auto& [key, file] : files_.Elements()) {
    auto* hdlFile = Prjrep::ObjectCast<CHdlFile>(file);
    bool upToDate = false;
    if (!hdlFile || hdlFile->isUpToDate(&upToDate, projectFiles.Get()) != CitI::kOk) return false;
    if (!upToDate) return false;
  }
  return true;
}

CitI::Result CHdlProject::RebuildHierarchy() {
  Prjrep::AutoRelease<IHdlDesignUnitSet> units;
  CitI::Result result = getAllDesignUnits(units.Out());
  if (result != CitI::kOk) return result;
  Prjrep::AutoRelease<CElaborator> elaborator;
  result = getElaborator(elaborator.Out());
  if (result != CitI::kOk) return result;
  Prjrep::AutoRelease<IHdlDesignUnitIterator> unit;
  result = units->CreateIterator(unit.Out());
  if (result != CitI::kOk) return result;
  Prjrep::AutoPtr<IHdlNetListNode> root;
  result = elaborator->Elaborate(getLibraryReferences(), unit.Get(), root.Out());
  if (result != CitI::kOk) return result;
  Prjrep::AutoRelease<IHdlFileIterator> files;
  if (files_.CreateIterator(files.Out()) == CitI::kOk)
    elaborator->AddMissingFileNodes(root.Get(), files.Get());
  cachedRoot_ = std::move(root);
  return CitI::kOk;
}

CitI::Result CHdlProject::getHierarchyRoot(IHdlNetListNode** out) {
  Prjrep::AutoOut<IHdlNetListNode> root(out);
  if (root.IsMissing()) return CitI::kInvalidArg;
  if (cachedRoot_ && IsHierarchyUpToDate()) {
    root.Set(cachedRoot_.Get());
    return CitI::kOk;
  }
  if (!interimRoot_) interimRoot_ = Prjrep::CreateInstanceAs<IHdlNetListNode>(ClassIds::CNetListNode());
  if (hierarchyRebuildInProgress) {
    root.Set(interimRoot_.Get());
    return interimRoot_ ? CitI::kOk : CitI::kFail;
  }

  CitI::Result result;
  {
    RebuildScope rebuilding;
    if (cachedRoot_) interimRoot_ = std::move(cachedRoot_);
    cachedRoot_ = nullptr;
    result = RebuildHierarchy();
    interimRoot_ = nullptr;
  }
  if (result != CitI::kOk) return result;
  if (!cachedRoot_) return CitI::kFail;
  root.Set(cachedRoot_.Get());
  return CitI::kOk;
}

}  // namespace Vad
