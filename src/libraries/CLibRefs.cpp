#include "CLibRefs.h"

#include <utility>

#include "CBasecellLoader.h"
#include "CBlockcellLoader.h"
#include "CTimecellLoader.h"
#include "Identifiers.h"
#include "Port/InitObjects.h"

namespace Vad {
namespace {

constexpr const char* kDefaultFamily = "kestrel";
constexpr const char* kAllItems = "all";
constexpr char kAnyPackage = '*';
// The order in which a family change reaches the loaders.
constexpr const char* kFamilyLoadOrder[] = {"basecell", "timecell", "blockcell"};

}  // namespace

CLibRefs::CLibRefs() {
  AddLoader("timecell", std::make_unique<CTimecellLoader>());
  AddLoader("basecell", std::make_unique<CBasecellLoader>());
  AddLoader("blockcell", std::make_unique<CBlockcellLoader>());
}

CLibRefs::~CLibRefs() = default;

CitI::IInterface* CLibRefs::QueryInterface(const Port::XUID& id) {
  if (id == InterfaceIds::ImplementationIdentity()) return this;
  if (id == Prjrep::IRefCount::Iid()) return &refs_;
  // Counted and created like every other class, so it answers IInterface as well.
  if (id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

void CLibRefs::LoadLibraries(const Port::StringBase& family) {
  Port::StringBase wanted = family.IsEmpty() ? Port::StringBase(kDefaultFamily) : family;
  if (wanted == family_) return;
  for (const char* name : kFamilyLoadOrder) ReloadLibrary(name, wanted);
  family_ = wanted;
}

bool CLibRefs::HasLibraryUnit(const Port::StringBase& library, const Port::StringBase& package,
                              const Port::StringBase& item, const Port::StringBase& name,
                              const Port::StringBase&) const {
  if (!item.Equals(kAllItems, Port::kCompareNoCase) && !item.Equals(name, Port::kCompareNoCase)) return false;
  const NameSet* packages = PackagesOf(packagesByLibrary_, library);
  const NameSet* lowerPackages = PackagesOf(lowerPackagesByLibrary_, Lower(library));
  if (!packages && !lowerPackages) return false;
  if (!package.IsEmpty() && package[0] == kAnyPackage) {
    return HasUnitInAnyPackage(packages, lowerPackages, library, name);
  }
  Port::StringBase key = UnitKey(name, library, package);
  return HasUnitKey(key) || HasLowerUnitKey(Lower(key));
}

void CLibRefs::AddLibraryUnit(const Port::StringBase& library, const Port::StringBase& package,
                              const Port::StringBase& name) {
  Port::StringBase key = UnitKey(name, library, package);
  packagesByLibrary_[library].insert(package);
  unitKeys_.insert(key);
  lowerUnitKeys_.insert(Lower(key));
  lowerPackagesByLibrary_[Lower(library)].insert(Lower(package));
}

void CLibRefs::RemoveLibrary(const Port::StringBase& library) {
  Port::StringBase marker = Port::StringBase("|") + library.view() + "|";
  // The lower-case keys hold no capitals, so a search for the lower-cased marker ignores case.
  Port::StringBase lowerMarker = Lower(marker);
  std::erase_if(unitKeys_,
                [&](const Port::StringBase& key) { return key.Find(marker) != Port::StringBase::npos; });
  std::erase_if(lowerUnitKeys_,
                [&](const Port::StringBase& key) { return key.Find(lowerMarker) != Port::StringBase::npos; });
  packagesByLibrary_.erase(library);
  lowerPackagesByLibrary_.erase(Lower(library));
}

CitI::Result CLibRefs::AddLoader(const Port::StringBase& name, std::unique_ptr<CLibLoader> loader) {
  if (!loader) return CitI::kInvalidArg;
  CLibLoader* added = loader.get();
  loaders_[name] = std::move(loader);
  return added->Load(this) ? CitI::kOk : CitI::kFail;
}

CitI::Result CLibRefs::ReloadLibrary(const Port::StringBase& name, const Port::StringBase& family) {
  CLibLoader* loader = LoaderOf(name);
  if (!loader) return CitI::kFail;
  loader->SetFamily(family);
  loader->Load(this);
  return CitI::kOk;
}

Port::StringBase CLibRefs::UnitKey(const Port::StringBase& name, const Port::StringBase& library,
                                   const Port::StringBase& package) {
  return name + "|" + library.view() + "|" + package.view();
}

Port::StringBase CLibRefs::Lower(Port::StringBase text) {
  text.MakeLower();
  return text;
}

const CLibRefs::NameSet* CLibRefs::PackagesOf(const std::map<Port::StringBase, NameSet>& registry,
                                              const Port::StringBase& library) {
  auto found = registry.find(library);
  return found == registry.end() ? nullptr : &found->second;
}

bool CLibRefs::HasUnitKey(const Port::StringBase& key) const { return unitKeys_.contains(key); }

bool CLibRefs::HasLowerUnitKey(const Port::StringBase& key) const { return lowerUnitKeys_.contains(key); }

bool CLibRefs::HasUnitInAnyPackage(const NameSet* packages, const NameSet* lowerPackages,
                                   const Port::StringBase& library, const Port::StringBase& name) const {
  if (packages) {
    for (const Port::StringBase& package : *packages) {
      if (HasUnitKey(UnitKey(name, library, package))) return true;
    }
  }
  if (lowerPackages) {
    for (const Port::StringBase& package : *lowerPackages) {
      if (HasLowerUnitKey(Lower(UnitKey(name, library, package)))) return true;
    }
  }
  return false;
}

CLibLoader* CLibRefs::LoaderOf(const Port::StringBase& name) const {
  auto found = loaders_.find(name);
  return found == loaders_.end() ? nullptr : found->second.get();
}

}  // namespace Vad
