#include "EntityDecl.h"

#include "Port/InitObjects.h"

namespace Vad {

EntityDecl::EntityDecl() : CVhdlDU({}, nullptr) {}

EntityDecl::EntityDecl(std::string_view name, DbObject* parent) : CVhdlDU(name, parent), entityName_(name) {
  SetType(DbType::kEntity);
}

CitI::IInterface* EntityDecl::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CVhdlDU::QueryInterface(id);
}

void EntityDecl::GetDesignUnitKey(Port::StringBase& out) const {
  Port::StringBase typeName;
  DbObject::GetDesignUnitKey(typeName);
  out.Format("%s|%s", typeName.c_str(), entityName_.c_str());
}

CitI::Result EntityDecl::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Load(archive);
  return result == CitI::kOk ? PersistStrings(archive, false, {&entityName_}) : result;
}

CitI::Result EntityDecl::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Save(archive);
  return result == CitI::kOk ? PersistStrings(archive, true, {&entityName_}) : result;
}

void EntityDecl::ComposeStoreKey(Port::StringBase& key) {
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), entityName_.view()});
  SetKey(key.view());
}

}  // namespace Vad
