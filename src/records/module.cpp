#include "module.h"

#include "Port/InitObjects.h"

namespace Vad {

module::module() :CHdlElement({}, nullptr) {}

module::module(std::string_view name, DbObject* parent) :CHdlElement(name, parent), moduleName_(name) {
  SetType(DbType::kModule);
}

CitI::IInterface* module::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CHdlElement::QueryInterface(id);
}

void module::GetDesignUnitKey(Port::StringBase& out) const {
  Port::StringBase typeName;
  DbObject::GetDesignUnitKey(typeName);
  out.Format("%s|%s", typeName.c_str(), moduleName_.c_str());
}

CitI::Result module::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Load(archive);
  return result == CitI::kOk ? PersistStrings(archive, false, {&moduleName_}) : result;
}

CitI::Result module::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Save(archive);
  return result == CitI::kOk ? PersistStrings(archive, true, {&moduleName_}) : result;
}

void module::ComposeStoreKey(Port::StringBase& key) {
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), moduleName_.view()});
  SetKey(key.view());
}

}  // namespace Vad
