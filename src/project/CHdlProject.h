// The HDL side of one design project: its source files keyed by full path, the parser
// configuration they are read with, and what is derived from all of them together.
#pragma once

#include <cstdint>
#include <utility>
#include <vector>

#include "CitI.h"
#include "HdlSets.h"
#include "IHdlElaborationData.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "IHdlParserConfig.h"
#include "IHdlProject.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TAssociativeSetHelper.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TRefCountHelper.h"

namespace Vad {

class CElaborator;
class CHdlFile;
class CLibRefs;
class CParserConfigBase;

// QueryInterface answers, in this order, IHdlFileSet, IHdlProject, Prjrep::IRefCount,
// IHdlElaborationData and IInterface (the object itself).
class CHdlProject final : public CitI::IInterface {
 public:
  CHdlProject();
  // Public for the class factory; the object is otherwise ended by its reference count.
  ~CHdlProject() override;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // ---- for the rest of the module ----
  // The elaborator with one reference for the caller; kInvalidArg for a null out-parameter.
  // The elaborator is made on first use and kept for the project's life.
  CitI::Result getElaborator(CElaborator** out);
  // The library references (no reference added), made on first use and brought to the
  // configuration's device family on every call.
  CLibRefs* getLibraryReferences();
  CParserConfigBase* GetParserConfigObject() const;

  // ---- IHdlProject ----
  CitI::Result getAllDesignUnits(IHdlDesignUnitSet** out);
  CitI::Result getNewParserConfig(IHdlParserConfig** out);
  CitI::Result createNewFile(IHdlFile** out);
  CitI::Result getParserConfig(IHdlParserConfig** out);

  // ---- IHdlFileSet ----
  CitI::Result AddFile(IHdlFile* file);
  CitI::Result RemoveFile(IHdlFileIterator* position);
  CitI::Result ClearFiles();

  // ---- IHdlElaborationData ----
  CitI::Result getUndefinedInstances();
  // The order of the whole project, or (for a `top` other than the root) of top's tree widened
  // by the units that share its files.
  CitI::Result getCompileOrder(IHdlNetListNode* top, IHdlFileIterator** out);
  // With `byUnit` clear, the order of the unit's widened tree; set: a module's own file, an
  // entity's whole project, an architecture's entity tree. 4 for other kinds with `byUnit` set;
  // 5 for a unit that is not in the tree and an architecture without its entity; 0 for a null
  // unit or out-parameter.
  CitI::Result getCompileOrderByDU(IHdlDesignUnit* unit, bool byUnit, IHdlFileIterator** out);
  CitI::Result getDesignUnitPorts(IHdlDesignUnit* unit, IHdlPortIterator** out);
  // The cached tree while it is up to date, else a new one. A request made while a rebuild runs
  // gets the previous tree (or an empty node) instead of a second rebuild.
  CitI::Result getHierarchyRoot(IHdlNetListNode** out);

 private:
  class XIHdlFileSet final : public Prjrep::TFace<IHdlFileSet, CHdlProject> {
   public:
    using TFace::TFace;
    CitI::Result Add(IHdlFile* file) override { return owner()->AddFile(file); }
    CitI::Result Remove(IHdlFileIterator* position) override { return owner()->RemoveFile(position); }
    CitI::Result CreateIterator(IHdlFileIterator** out) override;
    std::uint32_t GetCount() override;
    CitI::Result Clear() override { return owner()->ClearFiles(); }
  };

  class XIHdlProject final : public Prjrep::TFace<IHdlProject, CHdlProject> {
   public:
    using TFace::TFace;
    CitI::Result Reserved2() override { return CitI::kOk; }
    CitI::Result Reserved3() override { return CitI::kOk; }
    CitI::Result getAllDesignUnits(IHdlDesignUnitSet** out) override {
      return owner()->getAllDesignUnits(out);
    }
    CitI::Result getNewParserConfig(IHdlParserConfig** out) override {
      return owner()->getNewParserConfig(out);
    }
    CitI::Result createNewFile(IHdlFile** out) override { return owner()->createNewFile(out); }
    CitI::Result Reserved7(CitI::IInterface** out) override;
    CitI::Result getParserConfig(IHdlParserConfig** out) override { return owner()->getParserConfig(out); }
  };

  class XIHdlElaborationData final : public Prjrep::TFace<IHdlElaborationData, CHdlProject> {
   public:
    using TFace::TFace;
    CitI::Result getUndefinedInstances() override { return owner()->getUndefinedInstances(); }
    CitI::Result getCompileOrder(IHdlNetListNode* top, IHdlFileIterator** out) override {
      return owner()->getCompileOrder(top, out);
    }
    CitI::Result getCompileOrderByDU(IHdlDesignUnit* unit, bool byUnit, IHdlFileIterator** out) override {
      return owner()->getCompileOrderByDU(unit, byUnit, out);
    }
    CitI::Result getDesignUnitPorts(IHdlDesignUnit* unit, IHdlPortIterator** out) override {
      return owner()->getDesignUnitPorts(unit, out);
    }
    CitI::Result getHierarchyRoot(IHdlNetListNode** out) override { return owner()->getHierarchyRoot(out); }
  };

 public:
  // The file list that the project hands to the files it brings up to date now, for a file of
  // plug-in `pluginName`: none but for Verilog files.
  Prjrep::AutoRelease<IHdlFileIterator> CurrentFileList(const Port::StringBase& pluginName) const;

 private:
  // The project's Verilog files (V3 flag set, plug-in name "PLUGIN_Verilog" in any case), largest
  // order key first, and whether any of them needs a parse.
  struct VerilogSurvey {
    std::vector<IHdlFile*> files;
    bool changed = false;
  };

  static Port::StringBase KeyOf(IHdlFile* file);
  // The project link of a file that leaves the table is cleared when it points here.
  void Unlink(IHdlFile* file);
  void UnlinkAll();
  VerilogSurvey SurveyVerilogFiles() const;
  void ForgetHierarchy() { cachedRoot_ = nullptr; }
  // Whether the cached tree still stands for the files: it exists, no Verilog file changed and
  // every file is up to date.
  bool IsHierarchyUpToDate();
  // Collects the design units, elaborates them and caches the tree with its placeholder nodes.
  CitI::Result RebuildHierarchy();

  Prjrep::TAssociativeSetHelper<IHdlFileSet> files_;
  Prjrep::AutoPtr<IHdlParserConfig> parserConfig_;
  Prjrep::AutoPtr<CLibRefs> libraryReferences_;
  Prjrep::TRefCountHelper<CHdlProject> refs_{this};
  XIHdlFileSet fileSetFace_{this};
  XIHdlProject projectFace_{this};
  // The tree built at the last elaboration; empty until the hierarchy is built and after a file
  // is added or removed.
  Prjrep::AutoPtr<IHdlNetListNode> cachedRoot_;
  // What nested requests see while a rebuild runs.
  Prjrep::AutoPtr<IHdlNetListNode> interimRoot_;
  Prjrep::AutoPtr<CElaborator> elaborator_;
  XIHdlElaborationData elaborationDataFace_{this};
};

}  // namespace Vad
