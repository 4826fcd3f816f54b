#include "CHdlFile.h"

#include "CHdlElement.h"
#include "CHdlProject.h"
#include "CParserConfigBase.h"
#include "CParserConfigHolder.h"
#include "Identifiers.h"
#include "ParseResultsArchive.h"
#include "Port/File.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "Prjrep/Casts.h"

namespace Vad {

CHdlFile::CHdlFile()
    : fileNameHelper_(Prjrep::CreateInstanceAs<Prjrep::IFileNameHelper>(ClassIds::HostFileNameHelper())) {
  holder_.Attach(new CParserConfigHolder());
  holder_->SetFile(this);
}

CHdlFile::~CHdlFile() {
  // Records and the holder may be kept by others after the file is gone: their links to it must
  // not dangle.
  if (CParserConfigHolder* holder = GetHolder()) {
    if (IHdlDesignUnitSet* units = holder->GetUnitSet()) {
      Prjrep::AutoRelease<IHdlDesignUnitIterator> unit;
      if (units->CreateIterator(unit.Out()) == CitI::kOk && unit) {
        for (; !unit->IsDone(); unit->Next()) {
          if (auto* element =
                  dynamic_cast<CHdlElement*>(Prjrep::ImplementationCast<DbObject>(unit->Current())))
            element->SetFile(nullptr);
        }
      }
    }
    holder->SetFile(nullptr);
  }
}

CitI::IInterface* CHdlFile::QueryInterface(const Port::XUID& id) {
  if (id == CitI::IInterface::Iid()) return this;
  if (id == IHdlFile::Iid()) return &hdlFileFace_;
  if (id == IHdlFileV3::Iid()) return &hdlFileV3Face_;
  if (id == IFileCompReference::Iid()) return &fileCompReferenceFace_;
  if (id == Prjrep::IRefCount::Iid()) return &refs_;
  if (id == ICompAdmin::Iid()) return &compAdminFace_;
  if (id == Prjrep::IFileNameHelper::Iid()) return &fileNameHelperFace_;
  if (id == ISourceLibraryMember::Iid()) return &sourceLibraryMemberFace_;
  if (id == IHdlParseResults::Iid()) return &parseResultsFace_;
  return nullptr;
}

// ---- for the project and the rest of the module ------------------------------------------------

CitI::Result CHdlFile::isUpToDate(bool* upToDate, IHdlFileIterator* projectFiles) {
  if (!upToDate) return CitI::kInvalidArg;
  *upToDate = false;
  if (needsParse_) return CitI::kOk;
  CParserConfigHolder* holder = GetHolder();
  if (!holder) return CitI::kFail;
  return holder->IsUpToDate(upToDate, projectFiles);
}

CitI::Result CHdlFile::bringUpToDate(IHdlFileIterator* projectFiles) {
  bool upToDate = false;
  CitI::Result result = isUpToDate(&upToDate, projectFiles);
  if (result != CitI::kOk) return result;
  if (upToDate) return CitI::kOk;
  CParserConfigHolder* holder = GetHolder();
  if (!holder) return CitI::kFail;
  result = holder->Parse(projectFiles);
  if (result != CitI::kOk) return result;
  needsParse_ = false;
  return CitI::kOk;
}

CitI::Result CHdlFile::saveParseResults(Prjrep::IArchive* archive) {
  CParserConfigHolder* holder = GetHolder();
  if (needsParse_ || !holder) return CitI::kFail;
  return ParseResultsArchive::Save(holder->GetUnitSet(), archive);
}

CitI::Result CHdlFile::loadParseResults(Prjrep::IArchive* archive) {
  CParserConfigHolder* holder = GetHolder();
  if (!holder) return CitI::kFail;
  ParseResultsArchive::Records records;
  CitI::Result result = ParseResultsArchive::Load(archive, records);
  if (result != CitI::kOk) return result;
  Prjrep::AutoRelease<IHdlFileIterator> projectFiles;
  if (project_) projectFiles = project_->CurrentFileList(pluginName_);
  holder->AdoptUnits(records, projectFiles.Get());
  needsParse_ = false;
  return CitI::kOk;
}

CitI::Result CHdlFile::getDesignUnitCount(std::uint32_t* count) {
  if (!count) return CitI::kInvalidArg;
  CParserConfigHolder* holder = GetHolder();
  *count = holder ? holder->GetUnitCount() : 0;
  return CitI::kOk;
}

CParserConfigBase* CHdlFile::GetParserConfig() const {
  return project_ ? project_->GetParserConfigObject() : nullptr;
}

CParserConfigHolder* CHdlFile::GetHolder() const { return holder_.Get(); }

void CHdlFile::ExtractPorts(IHdlDesignUnit* unit, IHdlPortIterator** out) {
  CParserConfigHolder* holder = GetHolder();
  if (!holder) return;
  // The holder stays for the whole extraction even if the file is let go meanwhile.
  Prjrep::AutoPtr<CitI::IInterface> heldHolder(holder);
  holder->ExtractPorts(unit, out);
}

IHdlDesignUnitSet* CHdlFile::GetUnitSet() const {
  CParserConfigHolder* holder = GetHolder();
  return holder ? holder->GetUnitSet() : nullptr;
}

void CHdlFile::GetFullPath(Port::StringBase& out) const {
  out.Empty();
  if (fileNameHelper_) fileNameHelper_->GetFullPath(&out);
}

void CHdlFile::GetBaseName(Port::StringBase& out) const {
  out.Empty();
  if (fileNameHelper_) fileNameHelper_->GetBaseName(&out);
}

void CHdlFile::GetExtension(Port::StringBase& out) const {
  out.Empty();
  if (fileNameHelper_) fileNameHelper_->GetExtension(&out);
}

void CHdlFile::GetFileNamePart(Port::StringBase& out) const {
  GetBaseName(out);
  Port::StringBase extension;
  GetExtension(extension);
  if (!extension.IsEmpty()) out.Append('.').Append(extension.view());
}

bool CHdlFile::GetFullFileName(Port::StringBase& out) const {
  out.Empty();
  Port::StringBase directory;
  Port::StringBase fileName;
  if (!SplitFullPath(directory, fileName)) return false;
  out = directory;
  out.Append(fileName.view());
  return true;
}

bool CHdlFile::SplitFullPath(Port::StringBase& directory, Port::StringBase& fileName) const {
  if (!fileNameHelper_) return false;
  Port::StringBase fullPath;
  GetFullPath(fullPath);
  GetFileNamePart(fileName);
  // The helper's parts need not agree with its full path; never cut more than there is.
  std::size_t keep = fullPath.Length() > fileName.Length() ? fullPath.Length() - fileName.Length() : 0;
  directory = fullPath.Left(keep);
  return true;
}

void CHdlFile::GetLibraryName(Port::StringBase& out) const {
  out.Empty();
  if (!sourceLibrary_ || sourceLibrary_->GetName(&out) != CitI::kOk) out = "work";
}

// ---- IHdlFile ------------------------------------------------------------------------------------

CitI::Result CHdlFile::getProject(IHdlProject** out) {
  Prjrep::AutoOut<IHdlProject> project(out);
  if (project.IsMissing()) return CitI::kInvalidArg;
  if (project_) project.Set(Prjrep::QueryAs<IHdlProject>(project_));
  return CitI::kOk;
}

CitI::Result CHdlFile::setFilePath(const Port::StringBase& path, const Port::StringBase& baseDir) {
  if (!fileNameHelper_) return CitI::kFail;
  Port::StringBase cwd;
  Port::File::getcwd(&cwd);
  return fileNameHelper_->SetFilePath(path, baseDir, cwd);
}

CitI::Result CHdlFile::getFileName(Port::StringBase* directory, Port::StringBase* fileName) {
  if (!directory || !fileName) return CitI::kInvalidArg;
  return SplitFullPath(*directory, *fileName) ? CitI::kOk : CitI::kFail;
}

CitI::Result CHdlFile::getDesignUnits(IHdlDesignUnitIterator** out) {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  IHdlDesignUnitSet* units = GetUnitSet();
  return units ? units->CreateIterator(out) : CitI::kFail;
}

CitI::Result CHdlFile::getResultText(Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  out->Empty();
  CitI::Result result = bringUpToDate(nullptr);
  if (result != CitI::kOk) return result;
  *out = GetHolder()->GetResultText();
  return CitI::kOk;
}

CitI::Result CHdlFile::XIHdlFile::setNeedsParse(bool needsParse) {
  owner()->SetNeedsParse(needsParse);
  return CitI::kOk;
}

CitI::Result CHdlFile::XIHdlFile::Reserved8(CitI::IInterface*, CitI::IInterface** out) {
  if (out) *out = nullptr;
  return CitI::kNotImpl;
}

CitI::Result CHdlFile::XIHdlFile::setPluginName(const Port::StringBase& name) {
  owner()->pluginName_ = name;
  return CitI::kOk;
}

CitI::Result CHdlFile::XIHdlFile::getPluginName(Port::StringBase* out) {
  if (out) *out = owner()->pluginName_;
  return CitI::kOk;
}

CitI::Result CHdlFile::XIHdlFile::getOrderKey(std::uint64_t* out) {
  if (out) *out = owner()->orderKey_;
  return CitI::kOk;
}

CitI::Result CHdlFile::XIHdlFile::setOrderKey(std::uint64_t key) {
  owner()->orderKey_ = key;
  return CitI::kOk;
}

CitI::Result CHdlFile::XIHdlFile::getNeedsParse(bool* out) {
  if (out) *out = owner()->needsParse_;
  return CitI::kOk;
}

// ---- IHdlFileV3 ----------------------------------------------------------------------------------

CitI::Result CHdlFile::XIHdlFileV3::setV3Flag(bool flag) {
  owner()->v3Flag_ = flag;
  return CitI::kOk;
}

CitI::Result CHdlFile::XIHdlFileV3::getV3Flag(bool* out) {
  if (out) *out = owner()->v3Flag_;
  return CitI::kOk;
}

// ---- IFileCompReference --------------------------------------------------------------------------

CitI::Result CHdlFile::XIFileCompReference::setFileComponent(CitI::IInterface* file) {
  fileComponent_ = file;
  return CitI::kOk;
}

CitI::Result CHdlFile::XIFileCompReference::getFileComponent(IFile** out) {
  return out ? fileComponent_.CopyTo(out) : CitI::kOk;
}

// ---- ICompAdmin ----------------------------------------------------------------------------------

CitI::Result CHdlFile::InitializeAfterCreate(CitI::IInterface* context) {
  fileType_ = context;
  if (!fileType_) {
    Port_MsgManData::debugStub(
        "ERROR: HdlFile::InitializeAfterCreate - Invalid context parameter: expected IFileType.\n");
    return CitI::kInvalidArg;
  }
  return CitI::kOk;
}

// ---- ISourceLibraryMember ------------------------------------------------------------------------

CitI::Result CHdlFile::XISourceLibraryMember::getSourceLibrary(ISourceLibrary** out) {
  return owner()->sourceLibrary_.CopyTo(out);
}

CitI::Result CHdlFile::XISourceLibraryMember::setSourceLibrary(CitI::IInterface* library) {
  owner()->sourceLibrary_ = library;
  return CitI::kOk;
}

}  // namespace Vad
