#include "CHdlElement.h"

#include <cstdio>

#include "Arch.h"
#include "HdlSets.h"
#include "IBaseServices.h"
#include "IDesignUnitTypeStore.h"
#include "IFileCompReference.h"
#include "ISourceLibraryMember.h"
#include "Identifiers.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "Prjrep/Casts.h"
#include "SourceFileLink.h"

namespace Vad {
namespace {

constexpr std::uint32_t kKindsWithUnitFlag = DbType::kEntity | DbType::kArchitecture | DbType::kModule;

// Queries that need the unit's source file; a file link that is no source file answers nothing.
SourceFileLink* SourceFileOf(CitI::IInterface* fileLink) {
  return Prjrep::ObjectCast<SourceFileLink>(fileLink);
}

bool IsSourceFile(CitI::IInterface* fileLink) { return SourceFileOf(fileLink) != nullptr; }

Prjrep::AutoPtr<IFileType> FileTypeOfSourceFile(CitI::IInterface* fileLink) {
  SourceFileLink* file = SourceFileOf(fileLink);
  return file ? file->GetFileType() : Prjrep::AutoPtr<IFileType>();
}

Prjrep::AutoPtr<IHdlDesignUnitSet> UnitsOfSourceFile(CitI::IInterface* fileLink) {
  SourceFileLink* file = SourceFileOf(fileLink);
  return Prjrep::AutoPtr<IHdlDesignUnitSet>(file ? file->GetUnitSet() : nullptr);
}

bool FullFileNameOfSourceFile(CitI::IInterface* fileLink, Port::StringBase& out) {
  SourceFileLink* file = SourceFileOf(fileLink);
  return file && file->GetFullFileName(out);
}

void Debug(const char* text) { Port_MsgManData::debugStub("%s", text); }

template <class T>
CitI::Result CopyOut(const T& value, T* out) {
  if (!out) return CitI::kInvalidArg;
  *out = value;
  return CitI::kOk;
}

// Unsigned fields travel as the archive's signed 32-bit integers.
CitI::Result TransferUInt(Prjrep::IArchive* archive, bool saving, std::uint32_t& value) {
  if (saving) return archive->WriteInt(static_cast<std::int32_t>(value));
  std::int32_t read = 0;
  CitI::Result result = archive->ReadInt(&read);
  if (result == CitI::kOk) value = static_cast<std::uint32_t>(read);
  return result;
}

CitI::Result TransferInt(Prjrep::IArchive* archive, bool saving, std::int32_t& value) {
  return saving ? archive->WriteInt(value) : archive->ReadInt(&value);
}

CitI::Result TransferBool(Prjrep::IArchive* archive, bool saving, bool& value) {
  return saving ? archive->WriteBool(value) : archive->ReadBool(&value);
}

CitI::Result TransferString(Prjrep::IArchive* archive, bool saving, Port::StringBase& value) {
  return saving ? archive->WriteString(value) : archive->ReadString(&value);
}

}  // namespace

CHdlElement::CHdlElement(std::string_view name, DbObject* parent) : DbObject(name, parent) {
  timestamp_.SetToNow();
  transformBindings_.SetOwner(this);
}

CHdlElement::~CHdlElement() {
  clientData_.Reset();
  transformBindings_.Clear();
}

CitI::IInterface* CHdlElement::QueryInterface(const Port::XUID& id) {
  if (CitI::IInterface* answer = DbObject::QueryInterface(id)) return answer;
  if (id == Prjrep::IEventSender::Iid()) return &eventSender_;
  if (id == IHdlDesignUnit::Iid()) return &designUnitFace_;
  if (id == IHdlGraphicsPosition::Iid()) return &graphicsPositionFace_;
  if (id == IHdlClientData::Iid()) return &clientDataFace_;
  if (id == IHdlTextPosition::Iid()) return &textPositionFace_;
  if (id == Prjrep::IName::Iid()) return &nameFace_;
  if (id == IHdlElement::Iid()) return &elementFace_;
  if (id == IHdlDUProperties::Iid()) return &propertiesFace_;
  if (id == IInstanceData::Iid()) return &instanceDataFace_;
  if (id == Prjrep::ITimestamp::Iid()) return &timestamp_;
  if (id == IDesignUnit::Iid()) return &hostDesignUnitFace_;
  return nullptr;
}

// ---- persistence -------------------------------------------------------------------------------

CitI::Result CHdlElement::Load(Prjrep::IArchive* archive) { return Persist(archive, false); }

CitI::Result CHdlElement::Save(Prjrep::IArchive* archive) { return Persist(archive, true); }

CitI::Result CHdlElement::Persist(Prjrep::IArchive* archive, bool saving) {
  if (!archive) return CitI::kInvalidArg;
  CitI::Result result = PersistTimestamp(archive, saving);
  if (result == CitI::kOk) result = PersistObject(archive, saving);
  if (result == CitI::kOk) {
    result = saving ? archive->WriteXUID(designUnitTypeId_) : archive->ReadXUID(&designUnitTypeId_);
  }
  if (result == CitI::kOk) result = PersistPositions(archive, saving);
  if (result == CitI::kOk) result = TransferBool(archive, saving, unitFlag_);
  if (result == CitI::kOk) result = PersistClientData(archive, saving);
  if (result == CitI::kOk) result = PersistProperties(archive, saving);
  if (result == CitI::kOk) result = PersistInGenerate(archive, saving);
  return result;
}

CitI::Result CHdlElement::PersistStrings(Prjrep::IArchive* archive, bool saving,
                                         std::initializer_list<Port::StringBase*> fields) {
  CitI::Result result = CitI::kOk;
  for (auto field = fields.begin(); result == CitI::kOk && field != fields.end(); ++field) {
    result = TransferString(archive, saving, **field);
  }
  return result;
}

CitI::Result CHdlElement::PersistTimestamp(Prjrep::IArchive* archive, bool saving) {
  std::int64_t seconds = 0;
  std::int64_t microseconds = 0;
  if (saving) {
    timestamp_.GetTime(&seconds, &microseconds);
    CitI::Result result = archive->WriteInt64(seconds);
    return result == CitI::kOk ? archive->WriteInt64(microseconds) : result;
  }
  CitI::Result result = archive->ReadInt64(&seconds);
  if (result == CitI::kOk) result = archive->ReadInt64(&microseconds);
  if (result == CitI::kOk) timestamp_.SetTime(seconds, microseconds);
  return result;
}

CitI::Result CHdlElement::PersistPositions(Prjrep::IArchive* archive, bool saving) {
  CitI::Result result = TransferUInt(archive, saving, line_);
  if (result == CitI::kOk) result = TransferUInt(archive, saving, column_);
  if (result == CitI::kOk) result = TransferUInt(archive, saving, x_);
  if (result == CitI::kOk) result = TransferUInt(archive, saving, y_);
  if (result == CitI::kOk) result = TransferInt(archive, saving, reservedValue_);
  return result;
}

CitI::Result CHdlElement::PersistClientData(Prjrep::IArchive* archive, bool saving) {
  if (saving) return archive->WriteObjectRef(Prjrep::QueryAs<Prjrep::IPersist>(clientData_.Get()));
  CitI::IInterface* data = nullptr;
  CitI::Result result = archive->ReadObjectRef(&data);
  if (result == CitI::kOk) clientData_ = data;
  return result;
}

CitI::Result CHdlElement::PersistProperties(Prjrep::IArchive* archive, bool saving) {
  std::int32_t version = 0;
  CitI::Result result = archive->GetVersion(&version);
  if (result != CitI::kOk || version < 3) return result;
  std::int32_t count = static_cast<std::int32_t>(properties_.size());
  result = TransferInt(archive, saving, count);
  if (saving) {
    for (auto entry = properties_.begin(); result == CitI::kOk && entry != properties_.end(); ++entry) {
      result = archive->WriteString(entry->first);
      if (result == CitI::kOk) result = archive->WriteString(entry->second);
    }
    return result;
  }
  for (std::int32_t i = 0; result == CitI::kOk && i < count; ++i) {
    Port::StringBase key;
    Port::StringBase value;
    result = archive->ReadString(&key);
    if (result == CitI::kOk) result = archive->ReadString(&value);
    if (result == CitI::kOk) properties_.insert_or_assign(std::move(key), std::move(value));
  }
  return result;
}

CitI::Result CHdlElement::PersistInGenerate(Prjrep::IArchive* archive, bool saving) {
  std::int32_t version = 0;
  CitI::Result result = archive->GetVersion(&version);
  if (result != CitI::kOk || version < 9) return result;
  return TransferBool(archive, saving, inGenerate_);
}

// ---- file link and properties ------------------------------------------------------------------

void CHdlElement::SetFile(CitI::IInterface* file) { fileLink_ = Prjrep::QueryAs<CitI::IInterface>(file); }

CitI::Result CHdlElement::GetFileObject(CitI::IInterface** out) const {
  Prjrep::AutoOut<CitI::IInterface> result(out);
  if (result.IsMissing()) return CitI::kInvalidArg;
  result.Set(fileLink_);
  return CitI::kOk;
}

Prjrep::AutoPtr<IHdlFile> CHdlElement::FileAsHdlFile() const { return Prjrep::AutoPtr<IHdlFile>(fileLink_); }

CitI::Result CHdlElement::SetProperty(const Port::StringBase& key, const Port::StringBase& value) {
  if (key.IsEmpty()) return CitI::kFail;
  properties_.insert_or_assign(key, value);
  return CitI::kOk;
}

CitI::Result CHdlElement::GetProperty(const Port::StringBase& key, Port::StringBase& out) const {
  out.Empty();
  if (key.IsEmpty()) return CitI::kFail;
  auto found = properties_.find(key);
  if (found == properties_.end()) return CitI::kFail;
  out = found->second;
  return CitI::kOk;
}

CitI::Result CHdlElement::RemoveProperty(const Port::StringBase& key) {
  if (key.IsEmpty()) return CitI::kFail;
  return properties_.erase(key) ? CitI::kOk : CitI::kFail;
}

// ---- look-ups ----------------------------------------------------------------------------------

CitI::Result CHdlElement::GetDataStore(IDataStore** out) const {
  Prjrep::AutoOut<IDataStore> result(out);
  if (result.IsMissing()) {
    Debug("ERROR: CHdlElement::GetDataStore - Invalid Parameter.\n");
    return CitI::kInvalidArg;
  }
  auto services = Prjrep::CreateInstanceAs<IBaseServices>(ClassIds::HostBaseServices());
  if (!services) {
    Debug("ERROR: CHdlElement::GetDataStore - Failed BaseServices Factory create.\n");
    return CitI::kFail;
  }
  Prjrep::AutoRelease<CitI::IInterface> service;
  CitI::Result found = services->GetService(InterfaceIds::DataStoreService(), service.Out());
  auto* store = Prjrep::QueryAs<IDataStore>(service.Get());
  if (found != CitI::kOk || !store) {
    Debug("ERROR: CHdlElement::GetDataStore - Failed getting IDataStore from BaseServices.\n");
    return CitI::kFail;
  }
  result.Set(store);
  return CitI::kOk;
}

CitI::Result CHdlElement::GetFileType(IFileType** out) const {
  Prjrep::AutoOut<IFileType> result(out);
  if (result.IsMissing()) {
    Debug("ERROR: CHdlElement::GetFileType - Invalid Parameter.\n");
    return CitI::kNullOut;
  }
  if (!IsSourceFile(fileLink_)) {
    Debug("ERROR: CHdlElement::GetFileType - Unable to get the class pointer to CHdlFile.\n");
    return CitI::kFail;
  }
  auto fileType = FileTypeOfSourceFile(fileLink_);
  if (!fileType) {
    Debug("ERROR: CHdlElement::GetFileType - Unable to get the file type.\n");
    return CitI::kFail;
  }
  result.Set(fileType.Get());
  return CitI::kOk;
}

CitI::Result CHdlElement::GetDesignUnitType(IDesignUnitType** out) {
  if (!out) {
    Debug("ERROR: CHdlElement::GetDesignUnitType - Invalid Parameter.\n");
    return CitI::kInvalidArg;
  }
  *out = nullptr;
  Prjrep::AutoRelease<IDataStore> store;
  GetDataStore(store.Out());
  auto* typeStore = Prjrep::QueryAs<IDesignUnitTypeStore>(store.Get());
  if (!typeStore) {
    Debug("ERROR: CHdlElement::GetDesignUnitType - Unable to obtain the IDesignUnitTypeStore inteface .\n");
    return CitI::kFail;
  }
  Prjrep::AutoRelease<IFileType> fileType;
  if (GetFileType(fileType.Out()) != CitI::kOk || !fileType) {
    Debug("ERROR: CHdlElement::GetDesignUnitType - Unable to obtain the IFileType inteface .\n");
    return CitI::kFail;
  }
  typeStore->GetDesignUnitType(designUnitTypeId_, fileType.Get(), out);
  return CitI::kOk;
}

CitI::Result CHdlElement::GetLibraryName(Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  out->Empty();
  Prjrep::AutoRelease<IHdlFile> file;
  if (elementFace_.GetFile(file.Out()) != CitI::kOk) {
    Debug("Error - CHdlElement::GetLibraryName(): Unable to get the logical from from the design unit.\n");
    return CitI::kFail;
  }
  auto* member = Prjrep::QueryAs<ISourceLibraryMember>(file.Get());
  if (!member) {
    Debug("Error - CHdlElement::GetLibraryName(): Unable to get the ISourceLibraryMember interface.\n");
    return CitI::kFail;
  }
  Prjrep::AutoRelease<ISourceLibrary> library;
  if (member->getSourceLibrary(library.Out()) != CitI::kOk || !library) {
    *out = "work";
    return CitI::kOk;
  }
  auto* name = Prjrep::QueryAs<Prjrep::IName>(library.Get());
  if (!name) {
    Debug(
        "Error - CHdlElement::GetLibraryName(): Unable to get the IName interface from the ISourceLibrary "
        "component.\n");
    return CitI::kFail;
  }
  name->GetName(out);
  return CitI::kOk;
}

CitI::Result CHdlElement::FindEntity(std::int32_t, Arch* architecture, CHdlElement** out) {
  if (!out || !architecture) return CitI::kFail;
  *out = nullptr;
  if (!fileLink_) return CitI::kFail;
  auto units = UnitsOfSourceFile(fileLink_);
  if (!units) return CitI::kFail;
  return FindEntityAmong(units.Get(), architecture->GetEntityName().view(), out);
}

CitI::Result CHdlElement::FindEntityAmong(IHdlDesignUnitSet* units, std::string_view entityName,
                                          CHdlElement** out) {
  if (!out) return CitI::kFail;
  *out = nullptr;
  if (!units) return CitI::kFail;
  Port::StringBase wanted;
  wanted.Format("Entity|%.*s", static_cast<int>(entityName.size()), entityName.data());
  Prjrep::AutoRelease<IHdlDesignUnitIterator> unit;
  if (units->CreateIterator(unit.Out()) != CitI::kOk || !unit) return CitI::kFail;
  for (; !unit->IsDone(); unit->Next()) {
    auto* element = dynamic_cast<CHdlElement*>(Prjrep::ImplementationCast<DbObject>(unit->Current()));
    if (!element || !(element->GetType() & DbType::kDesignUnitKinds)) continue;
    Port::StringBase key;
    element->nameFace_.GetName(&key);
    if (key == wanted) {
      *out = element;
      return CitI::kOk;
    }
  }
  return 2;
}

bool CHdlElement::IsSameDesignUnit(CHdlElement* other) {
  if (!other || other->GetType() != GetType()) return false;
  if (other->designUnitTypeId_ != designUnitTypeId_) return false;
  Port::StringBase library;
  Port::StringBase otherLibrary;
  GetLibraryName(&library);
  other->GetLibraryName(&otherLibrary);
  if (library != otherLibrary || other->GetKey() != GetKey()) return false;
  if (!fileLink_ || !other->fileLink_) return false;
  Port::StringBase fullName;
  Port::StringBase otherFullName;
  return FullFileNameOfSourceFile(fileLink_, fullName) &&
         FullFileNameOfSourceFile(other->fileLink_, otherFullName) && fullName == otherFullName;
}

CitI::Result CHdlElement::GetPorts(IHdlPortIterator** out) {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  // Parsers that extract no ports leave `out` empty; the result is 1 either way.
  if (SourceFileLink* file = SourceFileOf(fileLink_)) file->ExtractPorts(&designUnitFace_, out);
  return CitI::kOk;
}

CitI::Result CHdlElement::GetUnitFlagOf(std::int32_t flag, bool* out) {
  if (!out) return CitI::kFail;
  if (!(GetType() & kKindsWithUnitFlag)) return 4;
  if (GetType() & DbType::kArchitecture) {
    CHdlElement* entity = nullptr;
    CitI::Result result = FindEntity(flag, dynamic_cast<Arch*>(this), &entity);
    if (result != CitI::kOk) return result;
    *out = entity->unitFlag_;
    return CitI::kOk;
  }
  *out = unitFlag_;
  return CitI::kOk;
}

// ---- faces -------------------------------------------------------------------------------------

CitI::Result CHdlElement::CHdlElement_IHdlDesignUnit::GetDesignUnit(CitI::IInterface*, IHdlDesignUnit** out) {
  Prjrep::AutoOut<IHdlDesignUnit>(out).Set(this);
  return CitI::kOk;
}

CitI::Result CHdlElement::CHdlElement_IHdlDesignUnit::GetUnitFlag(std::int32_t flag, bool* out) {
  return owner()->GetUnitFlagOf(flag, out);
}

CitI::Result CHdlElement::CHdlElement_IHdlDesignUnit::GetDesignUnitTypeId(Port::XUID* out) {
  return CopyOut(owner()->designUnitTypeId_, out);
}

CitI::Result CHdlElement::CHdlElement_IHdlGraphicsPosition::GetX(std::uint32_t* out) {
  return CopyOut(owner()->x_, out);
}

CitI::Result CHdlElement::CHdlElement_IHdlGraphicsPosition::GetY(std::uint32_t* out) {
  return CopyOut(owner()->y_, out);
}

CitI::Result CHdlElement::CHdlElement_IHdlClientData::SetClientData(CitI::IInterface* data) {
  owner()->clientData_ = data;
  return CitI::kOk;
}

CitI::Result CHdlElement::CHdlElement_IHdlClientData::GetClientData(CitI::IInterface** out) {
  return owner()->clientData_.CopyTo(out);
}

CitI::Result CHdlElement::CHdlElement_IHdlTextPosition::GetLine(std::uint32_t* out) {
  return CopyOut(owner()->line_, out);
}

CitI::Result CHdlElement::CHdlElement_IHdlTextPosition::GetColumn(std::uint32_t* out) {
  return CopyOut(owner()->column_, out);
}

CitI::Result CHdlElement::CHdlElement_IName::SetName(const Port::StringBase&) { return CitI::kOk; }

CitI::Result CHdlElement::CHdlElement_IName::GetName(Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  owner()->GetDesignUnitKey(*out);
  return CitI::kOk;
}

CitI::Result CHdlElement::CHdlElement_IHdlElement::GetFile(IHdlFile** out) {
  if (!out) return CitI::kInvalidArg;
  *out = owner()->FileAsHdlFile().Detach();
  return CitI::kOk;
}

CitI::Result CHdlElement::CHdlElement_IHdlElement::GetSourceFile(IHdlFile** out) { return GetFile(out); }

CitI::Result CHdlElement::CHdlElement_IHdlElement::GetView(CitI::IInterface** out) {
  if (out) *out = nullptr;
  return CitI::kNotImpl;
}

bool CHdlElement::CHdlElement_IHdlElement::isValidInView() {
  std::fputs("Undefined Interface: Vad::CHdlElement::CHdlElement_IHdlElement::isValidInView", stdout);
  std::fflush(stdout);
  return false;
}

CitI::Result CHdlElement::CHdlElement_IHdlDUProperties::GetProperty(const Port::StringBase& key,
                                                                    Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  return owner()->GetProperty(key, *out);
}

CitI::Result CHdlElement::CHdlElement_IHdlDUProperties::SetProperty(const Port::StringBase& key,
                                                                    const Port::StringBase& value) {
  return owner()->SetProperty(key, value);
}

CitI::Result CHdlElement::CHdlElement_IHdlDUProperties::RemoveProperty(const Port::StringBase& key) {
  return owner()->RemoveProperty(key);
}

CitI::Result CHdlElement::CHdlElement_IInstanceData::GetInGenerate(bool* out) {
  return CopyOut(owner()->inGenerate_, out);
}

CitI::Result CHdlElement::XIDesignUnit::GetDesignUnitType(IDesignUnitType** out) {
  return owner()->GetDesignUnitType(out);
}

CitI::Result CHdlElement::XIDesignUnit::GetDesignUnitView(CitI::IInterface** out) {
  if (out) *out = nullptr;
  return CitI::kNotImpl;
}

CitI::Result CHdlElement::XIDesignUnit::GetHostText(Port::StringBase* out) {
  return CopyOut(owner()->hostText_, out);
}

CitI::Result CHdlElement::XIDesignUnit::SetHostText(const Port::StringBase& text) {
  owner()->hostText_ = text;
  return CitI::kOk;
}

CitI::Result CHdlElement::XIDesignUnit::GetOutboundTransformBindings(ITransformBindingInstanceSet** out) {
  if (!out) {
    Debug("ERROR: DesignUnit::GetOutboundTransformBindings - Invalid Parameter.\n");
    return CitI::kNullOut;
  }
  Prjrep::AutoOut<ITransformBindingInstanceSet>(out).Set(&owner()->transformBindings_);
  return CitI::kOk;
}

CitI::Result CHdlElement::XIDesignUnit::GetReferencedTransformBindings(ITransformBindingInstanceSet** out) {
  if (!out) return CitI::kNullOut;
  *out = nullptr;
  auto* reference = Prjrep::QueryAs<IFileCompReference>(owner()->fileLink_);
  if (!reference) return CitI::kFail;
  Prjrep::AutoRelease<IFile> fileComponent;
  reference->getFileComponent(fileComponent.Out());
  auto* designUnit = Prjrep::QueryAs<IDesignUnit>(fileComponent.Get());
  if (!designUnit) return CitI::kFail;
  return designUnit->GetReferencedTransformBindings(out);
}

}  // namespace Vad
