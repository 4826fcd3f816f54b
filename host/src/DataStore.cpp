#include "Host/DataStore.h"

#include "ComponentSupport.h"
#include "Host/DesignUnitType.h"
#include "Prjrep/Casts.h"

namespace Host {
namespace {

// The live store, if any; the store clears it when it is destroyed.
DataStore* sharedStore = nullptr;

}  // namespace

Prjrep::AutoPtr<Vad::IDataStore> DataStore::Shared() {
  if (sharedStore) return Prjrep::AutoPtr<Vad::IDataStore>(sharedStore);
  auto* store = new DataStore;
  Prjrep::AutoRelease<Vad::IDataStore> created(store);
  sharedStore = store;
  return created;
}

DataStore::~DataStore() {
  if (sharedStore == this) sharedStore = nullptr;
}

CitI::IInterface* DataStore::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Vad::IDataStore::Iid()) return this;
  if (id == Vad::IDesignUnitTypeStore::Iid()) return &typeStoreFace_;
  if (id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result DataStore::SetValue(const Port::StringBase& key, const Port::StringBase& value) {
  if (key.IsEmpty()) return CitI::kInvalidArg;
  values_[key] = value;
  return CitI::kOk;
}

CitI::Result DataStore::GetValue(const Port::StringBase& key, Port::StringBase* out) {
  if (!out || key.IsEmpty()) return CitI::kInvalidArg;
  out->Empty();
  auto found = values_.find(key);
  if (found == values_.end()) return CitI::kFail;
  *out = found->second;
  return CitI::kOk;
}

CitI::Result DataStore::RemoveValue(const Port::StringBase& key) {
  if (key.IsEmpty()) return CitI::kInvalidArg;
  return values_.erase(key) ? CitI::kOk : CitI::kFail;
}

CitI::Result DataStore::GetValueCount(std::uint32_t* count) {
  return CopyOut(static_cast<std::uint32_t>(values_.size()), count);
}

CitI::Result DataStore::SetTypeName(const Port::XUID& typeId, const Port::StringBase& name) {
  if (name.IsEmpty()) return CitI::kInvalidArg;
  typeNames_[typeId] = name;
  for (auto& [key, type] : types_) {
    if (key.first == typeId) Prjrep::ObjectCast<DesignUnitType>(type.Get())->Rename(name.view());
  }
  return CitI::kOk;
}

CitI::Result DataStore::GetTypeName(const Port::XUID& typeId, Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  out->Empty();
  auto found = typeNames_.find(typeId);
  if (found == typeNames_.end()) return CitI::kFail;
  *out = found->second;
  return CitI::kOk;
}

CitI::Result DataStore::GetDesignUnitType(const Port::XUID& typeId, Vad::IFileType* fileType,
                                          Vad::IDesignUnitType** out) {
  Prjrep::AutoOut<Vad::IDesignUnitType> result(out);
  if (result.IsMissing() || !fileType) return CitI::kInvalidArg;
  Port::StringBase fileTypeName;
  if (fileType->GetName(&fileTypeName) != CitI::kOk) return CitI::kFail;
  Prjrep::AutoPtr<Vad::IDesignUnitType>& type = types_[{typeId, fileTypeName}];
  if (!type) type = DesignUnitType::Create(typeId, fileTypeName.view(), NameOfType(typeId).view());
  result.Set(type.Get());
  return CitI::kOk;
}

CitI::Result DataStore::GetTypeCount(std::uint32_t* count) {
  return CopyOut(static_cast<std::uint32_t>(types_.size()), count);
}

Port::StringBase DataStore::NameOfType(const Port::XUID& typeId) const {
  auto found = typeNames_.find(typeId);
  return found != typeNames_.end() ? found->second : Port::StringBase(typeId.ToString());
}

}  // namespace Host
