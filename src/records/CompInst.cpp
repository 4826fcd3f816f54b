#include "CompInst.h"

#include "Arch.h"
#include "EntityInst.h"
#include "Port/InitObjects.h"
#include "module.h"

namespace Vad {

CompInst::CompInst() : CHdlElement({}, nullptr) {}

CompInst::CompInst(std::string_view label, std::string_view componentName, DbObject* parent)
    : CHdlElement(label, parent), label_(label), componentName_(componentName) {
  SetType(DbType::kComponentInstantiation);
}

CitI::IInterface* CompInst::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CHdlElement::QueryInterface(id);
}

CitI::Result CompInst::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Load(archive);
  return result == CitI::kOk ? PersistStrings(archive, false, {&label_, &componentName_}) : result;
}

CitI::Result CompInst::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Save(archive);
  return result == CitI::kOk ? PersistStrings(archive, true, {&label_, &componentName_}) : result;
}

void CompInst::SetLabel(std::string_view label) {
  label_ = label;
  SetName(label);
}

void CompInst::ComposeStoreKey(Port::StringBase& key) {
  const char* entity = kInvalidParentEntity;
  const char* architecture = kInvalidParentArchitecture;
  DbObject* parent = GetParent();
  // The parent is the enclosing architecture or module; a missing or other parent must not be
  // read as one of them.
  if (parent && parent->GetType() == DbType::kArchitecture) {
    if (auto* parentArchitecture = dynamic_cast<Arch*>(parent)) {
      entity = parentArchitecture->GetEntityName().c_str();
      architecture = parentArchitecture->GetArchitectureName().c_str();
    }
  } else if (auto* parentModule = dynamic_cast<module*>(parent)) {
    entity = architecture = parentModule->GetModuleName().c_str();
  }
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), entity, architecture, label_.view(), componentName_.view(), ""});
  SetKey(key.view());
}

}  // namespace Vad
