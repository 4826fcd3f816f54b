#include "DbObject.h"

#include <array>
#include <bit>

#include "Identifiers.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "Prjrep/Casts.h"

namespace Vad {
namespace {

// Indexed by the position of the type code's single bit.
constexpr std::array<const char*, 15> kTypeNames{"File",
                                                 "Entity",
                                                 "Architecture",
                                                 "ComponentInstantiation",
                                                 "EntityInstantiation",
                                                 "Library",
                                                 "PackageDecl",
                                                 "PackageBody",
                                                 "Use",
                                                 "Include",
                                                 "Project",
                                                 "IncludedFile",
                                                 "ParserConfigHolder",
                                                 "Module",
                                                 "Generic"};

}  // namespace

DbObject::DbObject(std::string_view name, DbObject* parent) : name_(name) { SetParent(parent); }

DbObject::~DbObject() {
  // A child that outlives its parent (someone else holds it) must not keep a dangling back pointer.
  for (Child& child : children_) {
    if (child.object->parent_ == this) child.object->parent_ = nullptr;
    child.reference.Reset();
  }
  children_.clear();
}

CitI::IInterface* DbObject::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == CitI::IInterface::Iid()) return this;
  if (id == InterfaceIds::ImplementationIdentity()) return this;
  return nullptr;
}

void DbObject::GetDesignUnitKey(Port::StringBase& out) const {
  out.Empty();
  out.Append(GetTypeName());
}

void DbObject::SetParent(DbObject* parent) {
  parent_ = parent;
  if (parent) parent->AddChild(this);
}

void DbObject::AddChild(DbObject* child) {
  if (!child) return;
  children_.push_back(Child{child, Prjrep::AutoPtr<CitI::IInterface>(child)});
  child->parent_ = this;
}

const char* DbObject::TypeNameOf(std::uint32_t type) {
  if (!std::has_single_bit(type)) return "Unknown";
  auto bit = static_cast<std::size_t>(std::countr_zero(type));
  return bit < kTypeNames.size() ? kTypeNames[bit] : "Unknown";
}

void DbObject::AppendKeyPrefix(Port::StringBase& key) const {
  Port::StringBase prefix;
  JoinKeyFields(prefix, {key.view(), GetTypeName(), ""});
  key.Append(prefix.view());
}

void DbObject::JoinKeyFields(Port::StringBase& key, std::initializer_list<std::string_view> fields) {
  key.Empty();
  bool first = true;
  for (std::string_view field : fields) {
    if (!first) key.Append('|');
    key.Append(field);
    first = false;
  }
}

CitI::Result DbObject::PersistObject(Prjrep::IArchive* archive, bool saving) {
  if (!archive) return CitI::kInvalidArg;
  return saving ? SaveObject(archive) : LoadObject(archive);
}

CitI::Result DbObject::SaveObject(Prjrep::IArchive* archive) {
  CitI::Result result = archive->WriteInt(static_cast<std::int32_t>(type_));
  if (result != CitI::kOk) return result;
  if (parent_) {
    result = archive->WriteObjectRef(Prjrep::QueryAs<Prjrep::IPersist>(parent_));
  } else {
    result = archive->WriteObjectRef(nullptr);
    if (type_ != DbType::kProject) Port_MsgManData::debugStub("%s", "Error -- m_pParent can't be null\n");
  }
  if (result == CitI::kOk) result = SaveChildren(archive);
  if (result == CitI::kOk) result = archive->WriteString(name_);
  if (result == CitI::kOk) result = archive->WriteString(key_);
  if (result == CitI::kOk) result = archive->WriteBool(false);
  return result;
}

CitI::Result DbObject::SaveChildren(Prjrep::IArchive* archive) {
  CitI::Result result = archive->WriteInt(static_cast<std::int32_t>(children_.size()));
  for (std::size_t i = 0; result == CitI::kOk && i < children_.size(); ++i) {
    DbObject* child = children_[i].object;
    if (child->parent_ != this) child->parent_ = this;
    result = archive->WriteObject(Prjrep::QueryAs<Prjrep::IPersist>(child));
  }
  return result;
}

CitI::Result DbObject::LoadObject(Prjrep::IArchive* archive) {
  std::int32_t type = 0;
  CitI::Result result = archive->ReadInt(&type);
  if (result != CitI::kOk) return result;
  type_ = static_cast<std::uint32_t>(type);

  parent_ = nullptr;
  CitI::IInterface* parent = nullptr;
  const bool parentReadFailed = archive->ReadObjectRef(&parent) != CitI::kOk;
  if (parent) parent_ = Prjrep::ImplementationCast<DbObject>(parent);

  result = LoadChildren(archive);
  if (result == CitI::kOk) result = archive->ReadString(&name_);
  if (result == CitI::kOk) result = archive->ReadString(&key_);
  bool reserved = false;
  if (result == CitI::kOk) result = archive->ReadBool(&reserved);
  if (result == CitI::kOk && parentReadFailed) {
    Port_MsgManData::debugStub("DBObject m_pParent bad for %s %s\n", name_.c_str(), key_.c_str());
  }
  return result;
}

CitI::Result DbObject::LoadChildren(Prjrep::IArchive* archive) {
  std::int32_t count = 0;
  CitI::Result result = archive->ReadInt(&count);
  for (std::int32_t i = 0; result == CitI::kOk && i < count; ++i) {
    Prjrep::AutoRelease<CitI::IInterface> loaded;
    result = archive->ReadObject(loaded.Out());
    // A child that is no design object is dropped (its reference with it).
    DbObject* child = Prjrep::ImplementationCast<DbObject>(loaded.Get());
    if (result != CitI::kOk || !child) continue;
    if (!child->parent_) child->parent_ = this;
    children_.push_back(Child{child, std::move(loaded)});
  }
  return result;
}

}  // namespace Vad
