#include "EntityInst.h"

#include "Arch.h"
#include "PackageDecl.h"
#include "Port/InitObjects.h"

namespace Vad {

EntityInst::EntityInst() : CHdlElement({}, nullptr) {}

EntityInst::EntityInst(std::string_view label, DbObject* parent) : CHdlElement(label, parent) {
  SetType(DbType::kEntityInstantiation);
}

CitI::IInterface* EntityInst::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CHdlElement::QueryInterface(id);
}

CitI::Result EntityInst::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Load(archive);
  if (result != CitI::kOk) return result;
  return PersistStrings(archive, false, {&label_, &entityName_, &reserved_, &architectureName_});
}

CitI::Result EntityInst::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Save(archive);
  if (result != CitI::kOk) return result;
  return PersistStrings(archive, true, {&label_, &entityName_, &reserved_, &architectureName_});
}

void EntityInst::SetLabel(std::string_view label) {
  label_ = label;
  SetName(label);
}

void EntityInst::ComposeStoreKey(Port::StringBase& key) {
  const char* entity = kInvalidParentEntity;
  const char* architecture = kInvalidParentArchitecture;
  DbObject* parent = GetParent();
  auto* parentArchitecture =
      parent && (parent->GetType() & DbType::kArchitecture) ? dynamic_cast<Arch*>(parent) : nullptr;
  if (parentArchitecture) {
    entity = parentArchitecture->GetEntityName().c_str();
    architecture = parentArchitecture->GetArchitectureName().c_str();
  } else if (auto* configuration = dynamic_cast<PackageDecl*>(parent)) {
    // A configuration declaration, kept as a package declaration, binds these instances.
    entity = configuration->GetPackageName().c_str();
    architecture = "";
  }
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), entity, architecture, label_.view(), entityName_.view(),
                      reserved_.view(), architectureName_.view()});
  SetKey(key.view());
}

}  // namespace Vad
