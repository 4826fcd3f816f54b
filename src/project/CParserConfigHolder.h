// The parse-result holder of one source file: runs the file's parse, receives what the parser
// finds through the recording operations, and remembers what the parse depended on.
#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <vector>

#include "CitI.h"
#include "HdlSets.h"
#include "Host/VhdlName.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"
#include "SiblingPaths.h"

namespace Vad {

class CHdlFile;
class CLibRefs;
class CHdlElement;
class DbObject;
class Library;
class Use;
class EntityDecl;
class Arch;
class module;
class PackageBody;
class PackageDecl;
class generic;
class CompInst;
class EntityInst;
class IHdlFileIterator;
class IHdlDesignUnit;
class IHdlPortIterator;
class ParserFactory;

class CParserConfigHolder final : public CitI::IInterface {
 public:
  // The seven type slots: the identifier that records of each kind get, and whether the kind is
  // recorded at all.
  enum TypeSlot : int {
    kEntitySlot = 0,
    kArchitectureSlot = 1,
    kModuleSlot = 2,
    kPackageBodySlot = 3,
    kPackageDeclSlot = 4,
    kInstanceLabelSlot = 5,
    kTestVectorSlot = 6,
  };
  static constexpr int kTypeSlotCount = 7;
  using TypeIds = std::array<Port::XUID, kTypeSlotCount>;
  // A slot holding this identifier disables its kind.
  static const Port::XUID& NoneTypeId();
  static const TypeIds& DefaultTypeIds();

  CParserConfigHolder();
  ~CParserConfigHolder() override;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  virtual const char* TypeName() const { return "CParserConfigHolder"; }

  // The owning source file (no reference held).
  void SetFile(CHdlFile* file) { file_ = file; }
  CHdlFile* GetFile() const { return file_; }

  // File and configuration queries. Each empties `out` first and leaves it empty when no file
  // is set.
  void GetFullPath(Port::StringBase& out) const;
  void GetBaseName(Port::StringBase& out) const;
  void GetExtension(Port::StringBase& out) const;
  void GetFileName(Port::StringBase& out) const;
  void GetPluginName(Port::StringBase& out) const;
  void GetLibraryName(Port::StringBase& out) const;  // "work" without a source library
  // 1 with the property's text (empty when absent); 0 with empty text without a configuration.
  CitI::Result GetProperty(const Port::StringBase& name, Port::StringBase& value) const;
  CLibRefs* GetLibRefs() const;
  void SetTypeIds(const TypeIds& ids);
  const Port::XUID& GetTypeId(TypeSlot slot) const { return typeIds_[slot]; }
  // Full paths of the project's files with this file's plug-in name, as the last parse began.
  const SiblingPaths& GetSiblingPaths() const;
  // The device part named by the last EDIF netlist parsed.
  void SetPart(const Port::StringBase& part) { part_ = part; }
  const Port::StringBase& GetPart() const { return part_; }

  // Recording. Lines are 1-based; `type` is the identifier the new record keeps. Each returns
  // the record (owned by the holder; no reference for the caller) or null when nothing was
  // recorded.
  Library* AddLibrary(const Port::StringBase& name, std::uint32_t line, const Port::XUID& type);
  Use* AddUse(const Port::StringBase& dottedName, std::uint32_t line, const Port::XUID& type, bool inBody);
  EntityDecl* AddEntityDecl(const Port::StringBase& name, std::uint32_t line, bool portFlag,
                            const Port::XUID& type);
  Arch* AddArch(const Port::StringBase& archName, const Port::StringBase& entityName, std::uint32_t line,
                const Port::XUID& type);
  module* AddModule(const Port::StringBase& name, std::uint32_t line, bool flag, const Port::XUID& type,
                    const Port::StringBase& partition);
  PackageBody* AddPackageBody(const Port::StringBase& name, std::uint32_t line, const Port::XUID& type);
  PackageDecl* AddPackageDecl(const Port::StringBase& name, std::uint32_t line, const Port::XUID& type);
  // VHDL-2008 primary units kept as package declarations, so that stored files and hosts know
  // them. A context declaration stays the current unit until EndDeclaration, also across library
  // clauses, and collects the use clauses and context references inside it. A configuration
  // stays the current unit so that the entity and architectures it configures are recorded as
  // its entity instances. A package instance uses the generic package it instantiates.
  PackageDecl* AddContextDecl(const Port::StringBase& name, std::uint32_t line, const Port::XUID& type);
  PackageDecl* AddConfigurationDecl(const Port::StringBase& name, std::uint32_t line, const Port::XUID& type);
  PackageDecl* AddPackageInstance(const Port::StringBase& name, const Port::StringBase& genericPackage,
                                  std::uint32_t line, const Port::XUID& packageType,
                                  const Port::XUID& useType);
  // A use of a package that the unit recorded last needs whatever the begin flag says: a formal
  // package of its generic clause or a package instantiated inside it. Pending without a unit.
  Use* AddUnitUse(const Port::StringBase& dottedName, std::uint32_t line, const Port::XUID& type);
  // The end of a context declaration or configuration: later use clauses wait for the next unit.
  void EndDeclaration();
  // Whether an entity, architecture or configuration is the current unit.
  bool HasCurrentUnit() const { return currentUnit_ != nullptr; }
  generic* AddGeneric(const Port::StringBase& name, std::uint32_t line, const Port::XUID& type);
  CompInst* AddCompInst(const Port::StringBase& label, const Port::StringBase& component, std::uint32_t line,
                        const Port::XUID& type, const Port::StringBase& partition);
  EntityInst* AddEntityInst(const Port::StringBase& label, const Port::StringBase& entity,
                            const Port::StringBase& architecture, std::uint32_t line, const Port::XUID& type);
  void AddInstanceLabel(const Port::StringBase& label);
  void AddTestVector(const Port::StringBase& name);
  void AddConfigBinding(const Port::StringBase& instances, const Port::StringBase& component,
                        const Port::StringBase& entity, const Port::StringBase& architecture);
  void EnterGenerate();
  void LeaveGenerate(bool reset);
  void SetEntityPortFlag(bool flag);

  // Enters `record` under `key`, or under "key-Instance(n)" with the first free n when the key
  // is taken. The holder takes a reference. False (nothing stored) for an empty key.
  bool RegisterUnit(const Port::StringBase& key, CHdlElement* record);
  // The record entered under exactly `key` during the running parse, or null.
  CHdlElement* FindRecorded(const Port::StringBase& key) const;

  // The factory every holder's parse and port query goes to; the module's entry installs it
  // (not owned; it lives as long as the module).
  static void InstallParserFactory(const ParserFactory* factory);
  // The parse run: BeginParse, the file's parser, EndParse. `projectFiles` may be null. 0 when no
  // parser could be made.
  CitI::Result Parse(IHdlFileIterator* projectFiles);
  // The ports of `unit` as the parser of the file's plug-in name extracts them.
  void ExtractPorts(IHdlDesignUnit* unit, IHdlPortIterator** out);
  void BeginParse(IHdlFileIterator* projectFiles);
  void EndParse();
  // Makes `records` (design-unit records, in set order) the results of a parse of this file with
  // `projectFiles`, as if the parser had just recorded them.
  void AdoptUnits(const std::vector<Prjrep::AutoPtr<CitI::IInterface>>& records,
                  IHdlFileIterator* projectFiles);
  // Whether the last parse is still valid for this project file list (null: none).
  CitI::Result IsUpToDate(bool* valid, IHdlFileIterator* projectFiles) const;

  // The units of the last parse, in key order.
  IHdlDesignUnitSet* GetUnitSet() const { return unitSet_.Get(); }
  std::uint32_t GetUnitCount() const;
  // The result text (no operation of this system fills it).
  const Port::StringBase& GetResultText() const { return resultText_; }

 private:
  // What every unit-level recording resets: generate depth, component bindings, instance state.
  void ResetForNextUnit();
  void ResetInstanceState();
  // What the last parse depended on: the configuration's signature and the library.
  void TakeParseInputs();
  // Clears every plain pointer into the recorded units.
  void ForgetParseState();
  bool IsEnabled(TypeSlot slot) const { return typeEnabled_[slot]; }
  // Gives the new `record` its file, line and type and registers it under `key`, where the holder
  // keeps a reference of its own. False when refused: the record then lives only as long as its
  // creator's reference (or a parent's).
  bool Enter(CHdlElement* record, const Port::StringBase& key, std::uint32_t line, const Port::XUID& type);
  // The new unit's use list becomes the pending context, which is emptied.
  void TakePendingContext(CHdlElement* unit);
  void AttachUse(Use* use, bool inBody);
  // The use record of this selected name: the one recorded before or a new one.
  Use* RecordUse(const Port::StringBase& dottedName, std::uint32_t line, const Port::XUID& type);
  bool IsLibraryCell(const Port::StringBase& component) const;
  // Paths of the listed files whose plug-in name is this file's, ignoring case, in list order.
  // Shared between the files of one project list (see CProjectFileList).
  std::shared_ptr<const SiblingPaths> SiblingPathsOf(IHdlFileIterator* projectFiles) const;
  // Re-registers an instance under its first label.
  void RenameInstance(CHdlElement* instance, const Port::StringBase& label);
  static Port::StringBase DuplicateKey(const Port::StringBase& key, int number);
  void FreeDuplicateNumber(const Port::StringBase& key);
  void CopyInstance(const Port::StringBase& label);

  static inline const ParserFactory* parserFactory_ = nullptr;

  CHdlFile* file_ = nullptr;
  Port::StringBase signature_;
  Port::StringBase library_;
  std::shared_ptr<const SiblingPaths> siblingPaths_;
  Port::StringBase part_;
  std::map<Port::StringBase, Port::StringBase, Host::VhdlNameLess> componentBindings_;
  TypeIds typeIds_;
  std::array<bool, kTypeSlotCount> typeEnabled_{};
  std::int32_t generateDepth_ = 0;
  std::map<Port::StringBase, Prjrep::AutoPtr<CitI::IInterface>> recordedUnits_;
  // Per key that has duplicates: the first "-Instance(n)" number not known to be taken.
  std::map<Port::StringBase, int> nextDuplicate_;
  Prjrep::AutoPtr<IHdlDesignUnitSet> unitSet_;
  std::vector<Use*> pendingContext_;
  CHdlElement* currentUnit_ = nullptr;
  // The open context declaration (also the current unit while it is open), or null.
  CHdlElement* openContext_ = nullptr;
  // The entity, architecture, package, package body, context or configuration recorded last.
  CHdlElement* lastUnit_ = nullptr;
  CompInst* lastCompInst_ = nullptr;
  EntityInst* lastEntityInst_ = nullptr;
  std::uint32_t labelCount_ = 0;
  Port::StringBase resultText_;
  Prjrep::TRefCountHelper<> refs_{this};
};

}  // namespace Vad
