// The design-unit element: what every design-unit record has regardless of its kind (source-file
// link, text and graphics position, properties, type identifier, timestamp, event sender, client
// data, flags) and the nine faces through which the host sees a design unit.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <map>
#include <string_view>

#include "CEventSenderHelper.h"
#include "CTimestampHelper.h"
#include "DbObject.h"
#include "IDataStore.h"
#include "IDesignUnit.h"
#include "IDesignUnitType.h"
#include "IFileType.h"
#include "IHdlClientData.h"
#include "IHdlDUProperties.h"
#include "IHdlDesignUnit.h"
#include "IHdlElement.h"
#include "IHdlGraphicsPosition.h"
#include "IHdlTextPosition.h"
#include "IInstanceData.h"
#include "IName.h"
#include "ITransformBindingInstance.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TSequenceSetHelper.h"

namespace Vad {

class Arch;
class IHdlDesignUnitSet;
class IHdlPortIterator;

// QueryInterface answers, after DbObject's, IEventSender, IHdlDesignUnit, IHdlGraphicsPosition,
// IHdlClientData, IHdlTextPosition, Prjrep::IName, IHdlElement, IHdlDUProperties,
// IInstanceData, Prjrep::ITimestamp and IDesignUnit; anything else null.
class CHdlElement : public DbObject {
 public:
  // The timestamp is taken now; the reserved value starts at 4.
  CHdlElement(std::string_view name, DbObject* parent);
  ~CHdlElement() override;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  virtual CitI::Result Load(Prjrep::IArchive* archive);
  virtual CitI::Result Save(Prjrep::IArchive* archive);
  // The unit's type from the host's design-unit type store for its type identifier and its
  // file's type, with one reference for the caller. kInvalidArg for a null out-parameter, 0 when
  // the store or the file type cannot be reached, else 1 whatever the store answers.
  virtual CitI::Result GetDesignUnitType(IDesignUnitType** out);
  // Returns null in every class of this module.
  virtual CitI::IInterface* GetExtensionObject() { return nullptr; }

  // The source file (no reference held); null unlinks.
  void SetFile(CitI::IInterface* file);
  // The source-file object itself with one reference for the caller, or null; kInvalidArg for a
  // null out-parameter.
  CitI::Result GetFileObject(CitI::IInterface** out) const;

  void SetDesignUnitTypeId(const Port::XUID& id) { designUnitTypeId_ = id; }
  const Port::XUID& GetDesignUnitTypeId() const { return designUnitTypeId_; }
  void SetTextPosition(std::uint32_t line, std::uint32_t column) {
    line_ = line;
    column_ = column;
  }
  std::uint32_t GetLine() const { return line_; }
  std::uint32_t GetColumn() const { return column_; }
  void SetGraphicsPosition(std::uint32_t x, std::uint32_t y) {
    x_ = x;
    y_ = y;
  }
  std::uint32_t GetX() const { return x_; }
  std::uint32_t GetY() const { return y_; }
  std::int32_t GetReservedValue() const { return reservedValue_; }
  // The port flag of entities and the flag of modules.
  void SetUnitFlag(bool flag) { unitFlag_ = flag; }
  bool GetUnitFlag() const { return unitFlag_; }
  void SetInGenerate(bool inGenerate) { inGenerate_ = inGenerate; }
  bool IsInGenerate() const { return inGenerate_; }
  const std::map<Port::StringBase, Port::StringBase>& GetProperties() const { return properties_; }
  // 0 for an empty key; else inserts or replaces and returns 1.
  CitI::Result SetProperty(const Port::StringBase& key, const Port::StringBase& value);
  // Empties `out`; 0 for an empty or unknown key, else 1 with the value.
  CitI::Result GetProperty(const Port::StringBase& key, Port::StringBase& out) const;
  // 0 for an empty or unknown key, else 1.
  CitI::Result RemoveProperty(const Port::StringBase& key);
  const Port::StringBase& GetHostText() const { return hostText_; }

  // The host's data store, reached through its base services, with one reference for the caller.
  // kInvalidArg for a null out-parameter, 0 when either cannot be reached.
  CitI::Result GetDataStore(IDataStore** out) const;
  // The file type of the unit's source file, with one reference for the caller. kNullOut for a
  // null out-parameter, 0 when the file link is no source file or it has no file type.
  CitI::Result GetFileType(IFileType** out) const;
  // The name of the source library of the unit's file ("work" when the file belongs to none).
  // Empties `out`; 0 when the file or its library cannot be asked.
  CitI::Result GetLibraryName(Port::StringBase* out);
  // The entity of `architecture` among the units of this element's source file (no reference is
  // added). 0 for a null argument or when the file's units cannot be reached, 2 when none
  // matches; `flag` is not used.
  CitI::Result FindEntity(std::int32_t flag, Arch* architecture, CHdlElement** out);
  // The first unit of `units` whose kind is a design-unit kind and whose design-unit key is
  // "Entity|<entityName>"; 2 when none is.
  static CitI::Result FindEntityAmong(IHdlDesignUnitSet* units, std::string_view entityName,
                                      CHdlElement** out);
  // Same kind, type identifier, library name and store key, and source files of equal full names.
  bool IsSameDesignUnit(CHdlElement* other);
  // The ports of this unit as its source file's parser extracts them; kInvalidArg for a null
  // out-parameter, else 1 (with `out` null when nothing was extracted).
  CitI::Result GetPorts(IHdlPortIterator** out);

 protected:
  // Transfers `fields` in order; stops at the first archive result other than 1 and returns it.
  static CitI::Result PersistStrings(Prjrep::IArchive* archive, bool saving,
                                     std::initializer_list<Port::StringBase*> fields);

 private:
  class CHdlElement_IHdlDesignUnit final : public Prjrep::TFace<IHdlDesignUnit, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result GetDesignUnit(CitI::IInterface* context, IHdlDesignUnit** out) override;
    CitI::Result GetUnitFlag(std::int32_t flag, bool* out) override;
    CitI::Result GetDesignUnitTypeId(Port::XUID* out) override;
  };
  class CHdlElement_IHdlGraphicsPosition final : public Prjrep::TFace<IHdlGraphicsPosition, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result GetX(std::uint32_t* out) override;
    CitI::Result GetY(std::uint32_t* out) override;
  };
  class CHdlElement_IHdlClientData final : public Prjrep::TFace<IHdlClientData, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result SetClientData(CitI::IInterface* data) override;
    CitI::Result GetClientData(CitI::IInterface** out) override;
  };
  class CHdlElement_IHdlTextPosition final : public Prjrep::TFace<IHdlTextPosition, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result GetLine(std::uint32_t* out) override;
    CitI::Result GetColumn(std::uint32_t* out) override;
  };
  class CHdlElement_IName final : public Prjrep::TFace<Prjrep::IName, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result SetName(const Port::StringBase& name) override;
    CitI::Result GetName(Port::StringBase* out) override;
  };
  class CHdlElement_IHdlElement final : public Prjrep::TFace<IHdlElement, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result GetFile(IHdlFile** out) override;
    CitI::Result GetSourceFile(IHdlFile** out) override;
    CitI::Result GetView(CitI::IInterface** out) override;
    bool isValidInView() override;
  };
  class CHdlElement_IHdlDUProperties final : public Prjrep::TFace<IHdlDUProperties, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result GetProperty(const Port::StringBase& key, Port::StringBase* out) override;
    CitI::Result SetProperty(const Port::StringBase& key, const Port::StringBase& value) override;
    CitI::Result RemoveProperty(const Port::StringBase& key) override;
  };
  class CHdlElement_IInstanceData final : public Prjrep::TFace<IInstanceData, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result GetInGenerate(bool* out) override;
  };
  class XIDesignUnit final : public Prjrep::TFace<IDesignUnit, CHdlElement> {
   public:
    using TFace::TFace;
    CitI::Result GetDesignUnitType(IDesignUnitType** out) override;
    CitI::Result GetDesignUnitView(CitI::IInterface** out) override;
    CitI::Result GetHostText(Port::StringBase* out) override;
    CitI::Result SetHostText(const Port::StringBase& text) override;
    CitI::Result GetOutboundTransformBindings(ITransformBindingInstanceSet** out) override;
    CitI::Result GetReferencedTransformBindings(ITransformBindingInstanceSet** out) override;
  };

  // Load and Save share one routine; each part stops at the first archive result other than 1.
  CitI::Result Persist(Prjrep::IArchive* archive, bool saving);
  CitI::Result PersistTimestamp(Prjrep::IArchive* archive, bool saving);
  CitI::Result PersistPositions(Prjrep::IArchive* archive, bool saving);
  CitI::Result PersistClientData(Prjrep::IArchive* archive, bool saving);
  CitI::Result PersistProperties(Prjrep::IArchive* archive, bool saving);
  CitI::Result PersistInGenerate(Prjrep::IArchive* archive, bool saving);

  CitI::Result GetUnitFlagOf(std::int32_t flag, bool* out);
  // The file link as IHdlFile with one reference for the caller, or null.
  Prjrep::AutoPtr<IHdlFile> FileAsHdlFile() const;

  CitI::IInterface* fileLink_ = nullptr;  // no reference held
  std::map<Port::StringBase, Port::StringBase> properties_;
  Port::XUID designUnitTypeId_;
  std::uint32_t line_ = 0;
  std::uint32_t column_ = 0;
  std::uint32_t x_ = 0;
  std::uint32_t y_ = 0;
  std::int32_t reservedValue_ = 4;
  bool unitFlag_ = false;
  Prjrep::AutoPtr<CitI::IInterface> clientData_;
  Prjrep::CTimestampHelper timestamp_{this};
  Prjrep::CEventSenderHelper eventSender_{this};
  bool inGenerate_ = false;
  CHdlElement_IHdlDesignUnit designUnitFace_{this};
  CHdlElement_IHdlGraphicsPosition graphicsPositionFace_{this};
  CHdlElement_IHdlClientData clientDataFace_{this};
  CHdlElement_IHdlTextPosition textPositionFace_{this};
  CHdlElement_IName nameFace_{this};
  CHdlElement_IHdlElement elementFace_{this};
  CHdlElement_IHdlDUProperties propertiesFace_{this};
  CHdlElement_IInstanceData instanceDataFace_{this};
  Port::StringBase hostText_;
  Prjrep::TSequenceSetHelper<ITransformBindingInstanceSet> transformBindings_;
  XIDesignUnit hostDesignUnitFace_{this};
};

}  // namespace Vad
