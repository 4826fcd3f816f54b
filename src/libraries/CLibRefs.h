// The library references: whether a package of the maker's cell libraries declares a component
// of a given name. The component names come from the "vcomponents" packages of the libraries
// basecell, blockcell and timecell, read by one loader per library for the project's device
// family.
#pragma once

#include <map>
#include <memory>
#include <set>

#include "CLibLoader.h"
#include "CitI.h"
#include "Port/StringBase.h"
#include "Prjrep/TRefCountHelper.h"

namespace Vad {

class CLibRefs final : public CitI::IInterface {
 public:
  // Registers the timecell, basecell and blockcell loaders and loads each at once from its
  // default directory. Without CORVANE in the environment the loaders find nothing.
  CLibRefs();
  // Public for the class factory; the object is otherwise ended by its reference count.
  ~CLibRefs() override;

  // Answers the implementation identity, IRefCount and IInterface.
  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  // Follows the project's device family (empty means "kestrel"); the libraries are loaded again
  // only when the family changed.
  void LoadLibraries(const Port::StringBase& family);
  // Whether `package` of `library` declares `name`, in exact case or after lower-casing both. A
  // package beginning with "*" stands for every package of the library. An `item` other than
  // "all" must name the component itself. The language does not change the answer.
  bool HasLibraryUnit(const Port::StringBase& library, const Port::StringBase& package,
                      const Port::StringBase& item, const Port::StringBase& name,
                      const Port::StringBase& language) const;
  void AddLibraryUnit(const Port::StringBase& library, const Port::StringBase& package,
                      const Port::StringBase& name);
  // Forgets every component and package of the library.
  void RemoveLibrary(const Port::StringBase& library);
  // Takes over `loader` under `name` (destroying a loader registered there before) and loads it.
  // kOk when it loaded, kFail when not, kInvalidArg for a null loader.
  CitI::Result AddLoader(const Port::StringBase& name, std::unique_ptr<CLibLoader> loader);
  // Sets the family of the loader registered under `name` and loads it. 1, or 0 when no loader
  // has that name.
  CitI::Result ReloadLibrary(const Port::StringBase& name, const Port::StringBase& family);

  // The family of the last LoadLibraries; empty before it.
  const Port::StringBase& Family() const { return family_; }

 private:
  using NameSet = std::set<Port::StringBase>;

  static Port::StringBase UnitKey(const Port::StringBase& name, const Port::StringBase& library,
                                  const Port::StringBase& package);
  static Port::StringBase Lower(Port::StringBase text);
  static const NameSet* PackagesOf(const std::map<Port::StringBase, NameSet>& registry,
                                   const Port::StringBase& library);
  bool HasUnitKey(const Port::StringBase& key) const;
  bool HasLowerUnitKey(const Port::StringBase& key) const;
  bool HasUnitInAnyPackage(const NameSet* packages, const NameSet* lowerPackages,
                           const Port::StringBase& library, const Port::StringBase& name) const;
  CLibLoader* LoaderOf(const Port::StringBase& name) const;

  Port::StringBase family_;
  std::map<Port::StringBase, NameSet> packagesByLibrary_;
  std::map<Port::StringBase, NameSet> lowerPackagesByLibrary_;
  NameSet unitKeys_;
  NameSet lowerUnitKeys_;
  std::map<Port::StringBase, std::unique_ptr<CLibLoader>> loaders_;
  Prjrep::TRefCountHelper<CLibRefs> refs_{this};
};

}  // namespace Vad
