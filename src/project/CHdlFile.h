// One design source file of a project: its path (through the host's file-name helper), its
// plug-in name, its library, and the parse-result holder that parses it lazily and keeps its
// design units.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "HdlSets.h"
#include "ICompAdmin.h"
#include "IFile.h"
#include "IFileCompReference.h"
#include "IFileNameHelper.h"
#include "IFileType.h"
#include "IHdlFile.h"
#include "IHdlParseResults.h"
#include "ISourceLibrary.h"
#include "ISourceLibraryMember.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TFileNameHelperFace.h"
#include "Prjrep/TRefCountHelper.h"
#include "SourceFileLink.h"

namespace Vad {

class CHdlProject;
class CParserConfigBase;
class CParserConfigHolder;

// QueryInterface answers, in this order, IInterface (the object itself), IHdlFile, IHdlFileV3,
// IFileCompReference, Prjrep::IRefCount, ICompAdmin, Prjrep::IFileNameHelper,
// ISourceLibraryMember and IHdlParseResults.
class CHdlFile final : public CitI::IInterface, public SourceFileLink {
 public:
  // Needs a parse; makes its holder and, through the registry, its file-name helper.
  CHdlFile();
  // Public for the class factory; the object is otherwise ended by its reference count.
  ~CHdlFile() override;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // ---- for the project and the rest of the module ----
  // Parses when the file is out of date for `projectFiles` (may be null). The parse's result
  // when it is not 1 (the needs-parse flag then stays); else 1 with the flag cleared.
  CitI::Result bringUpToDate(IHdlFileIterator* projectFiles);
  // 1 with the answer (false while the file needs a parse); 0 when the holder cannot be reached.
  CitI::Result isUpToDate(bool* upToDate, IHdlFileIterator* projectFiles);
  // The number of units of the last parse; 1.
  CitI::Result getDesignUnitCount(std::uint32_t* count);

  // The project link, plain and non-owning; the project sets and clears it.
  void SetProject(CHdlProject* project) { project_ = project; }
  CHdlProject* GetProjectObject() const { return project_; }
  // The configuration the file is parsed with: its project's. Null outside a project.
  CParserConfigBase* GetParserConfig() const;
  CParserConfigHolder* GetHolder() const;
  // The units of the last parse (no reference added), or null without a holder.
  IHdlDesignUnitSet* GetUnitSet() const override;
  // The file type with one reference for the caller, or null.
  Prjrep::AutoPtr<IFileType> GetFileType() const override { return fileType_; }
  // Through the holder's parser factory; nothing without a holder.
  void ExtractPorts(IHdlDesignUnit* unit, IHdlPortIterator** out) override;

  // Path parts from the file-name helper; empty without one.
  void GetFullPath(Port::StringBase& out) const;
  void GetBaseName(Port::StringBase& out) const;
  void GetExtension(Port::StringBase& out) const;
  // The base name, plus "." and the extension when there is one.
  void GetFileNamePart(Port::StringBase& out) const;
  // Directory followed by file name, as getFileName gives them; false without a helper.
  bool GetFullFileName(Port::StringBase& out) const override;
  // The source library's name; "work" when the file has none.
  void GetLibraryName(Port::StringBase& out) const;
  const Port::StringBase& GetPluginName() const { return pluginName_; }
  bool GetNeedsParse() const { return needsParse_; }
  void SetNeedsParse(bool needsParse) { needsParse_ = needsParse; }
  std::uint64_t GetOrderKey() const { return orderKey_; }
  bool GetV3Flag() const { return v3Flag_; }

  // ---- IHdlFile ----
  CitI::Result getProject(IHdlProject** out);
  CitI::Result setFilePath(const Port::StringBase& path, const Port::StringBase& baseDir);
  CitI::Result getFileName(Port::StringBase* directory, Port::StringBase* fileName);
  CitI::Result getDesignUnits(IHdlDesignUnitIterator** out);
  CitI::Result getResultText(Port::StringBase* out);

  // ---- ICompAdmin ----
  CitI::Result InitializeAfterCreate(CitI::IInterface* context);

  // ---- IHdlParseResults ----
  CitI::Result saveParseResults(Prjrep::IArchive* archive);
  CitI::Result loadParseResults(Prjrep::IArchive* archive);

 private:
  class XIHdlFile final : public Prjrep::TFace<IHdlFile, CHdlFile> {
   public:
    using TFace::TFace;
    CitI::Result parseIfNeeded() override { return owner()->bringUpToDate(nullptr); }
    CitI::Result setNeedsParse(bool needsParse) override;
    CitI::Result getProject(IHdlProject** out) override { return owner()->getProject(out); }
    CitI::Result setFilePath(const Port::StringBase& path, const Port::StringBase& baseDir) override {
      return owner()->setFilePath(path, baseDir);
    }
    CitI::Result getFileName(Port::StringBase* directory, Port::StringBase* fileName) override {
      return owner()->getFileName(directory, fileName);
    }
    CitI::Result getDesignUnits(CitI::IInterface*, IHdlDesignUnitIterator** out) override {
      return owner()->getDesignUnits(out);
    }
    CitI::Result Reserved8(CitI::IInterface* argument, CitI::IInterface** out) override;
    CitI::Result getResultText(Port::StringBase* out) override { return owner()->getResultText(out); }
    CitI::Result setPluginName(const Port::StringBase& name) override;
    CitI::Result getPluginName(Port::StringBase* out) override;
    CitI::Result getOrderKey(std::uint64_t* out) override;
    CitI::Result getOrderKeyAlias(std::uint64_t* out) override { return getOrderKey(out); }
    CitI::Result setOrderKey(std::uint64_t key) override;
    CitI::Result getNeedsParse(bool* out) override;
  };

  class XIHdlFileV3 final : public Prjrep::TFace<IHdlFileV3, CHdlFile> {
   public:
    using TFace::TFace;
    CitI::Result setV3Flag(bool flag) override;
    CitI::Result getV3Flag(bool* out) override;
  };

  class XIFileCompReference final : public Prjrep::TFace<IFileCompReference, CHdlFile> {
   public:
    using TFace::TFace;
    CitI::Result setFileComponent(CitI::IInterface* file) override;
    CitI::Result getFileComponent(IFile** out) override;

   private:
    Prjrep::AutoPtr<IFile> fileComponent_;
  };

  class XICompAdmin final : public Prjrep::TFace<ICompAdmin, CHdlFile> {
   public:
    using TFace::TFace;
    CitI::Result InitializeAfterCreate(CitI::IInterface*, CitI::IInterface* context) override {
      return owner()->InitializeAfterCreate(context);
    }
    CitI::Result Reserved3() override { return CitI::kNotImpl; }
    CitI::Result Reserved4() override { return CitI::kNotImpl; }
    CitI::Result Reserved5() override { return CitI::kNotImpl; }
  };

  class XISourceLibraryMember final : public Prjrep::TFace<ISourceLibraryMember, CHdlFile> {
   public:
    using TFace::TFace;
    CitI::Result getSourceLibrary(ISourceLibrary** out) override;
    CitI::Result setSourceLibrary(CitI::IInterface* library) override;
  };

  class XIHdlParseResults final : public Prjrep::TFace<IHdlParseResults, CHdlFile> {
   public:
    using TFace::TFace;
    CitI::Result saveParseResults(Prjrep::IArchive* archive) override {
      return owner()->saveParseResults(archive);
    }
    CitI::Result loadParseResults(Prjrep::IArchive* archive) override {
      return owner()->loadParseResults(archive);
    }
  };

  // Directory (the full path minus the file name) and file name; false without a helper.
  bool SplitFullPath(Port::StringBase& directory, Port::StringBase& fileName) const;

  CHdlProject* project_ = nullptr;
  Port::StringBase pluginName_;
  bool needsParse_ = true;
  Prjrep::AutoPtr<CParserConfigHolder> holder_;
  Prjrep::AutoPtr<Prjrep::IFileNameHelper> fileNameHelper_;
  std::uint64_t orderKey_ = 0;
  Prjrep::AutoPtr<IFileType> fileType_;
  bool v3Flag_ = false;
  Prjrep::TRefCountHelper<CHdlFile> refs_{this};
  XIHdlFile hdlFileFace_{this};
  XIHdlFileV3 hdlFileV3Face_{this};
  XIFileCompReference fileCompReferenceFace_{this};
  XICompAdmin compAdminFace_{this};
  // Hands every operation to the file's own helper; kFail when the file has none.
  Prjrep::TFileNameHelperFace<CHdlFile> fileNameHelperFace_{this, &fileNameHelper_};
  Prjrep::AutoPtr<ISourceLibrary> sourceLibrary_;
  XISourceLibraryMember sourceLibraryMemberFace_{this};
  XIHdlParseResults parseResultsFace_{this};
};

}  // namespace Vad
