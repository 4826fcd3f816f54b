// A loader of one of the maker's compiled VHDL cell libraries: knows where the library lives for
// the current device family, writes the library mapping file that the VHDL library loader reads
// and enters the component names of the library's "vcomponents" package into the library
// references.
#pragma once

#include <array>
#include <cstddef>
#include <string_view>

#include "Port/StringBase.h"

namespace Vad {

class CLibRefs;

class CLibLoader {
 public:
  CLibLoader(const CLibLoader&) = delete;
  CLibLoader& operator=(const CLibLoader&) = delete;
  virtual ~CLibLoader() = default;

  // Replaces what `references` knew of this library by the components the library declares now.
  // Runs in a fresh temporary directory holding the mapping file, with the host's message
  // managers silenced; the working directory is restored and the temporary directory removed on
  // every path. False when the library could not be loaded (it then contributes nothing) or
  // `references` is null.
  virtual bool Load(CLibRefs* references);
  // Chooses the family's library directory when the family ships its own library, else the
  // default one. A changed choice is loaded at once into the references of the last Load.
  virtual void SetFamily(const Port::StringBase& family);

  const Port::StringBase& LibraryName() const { return libraryName_; }
  // The family's directory; empty while the default directory applies.
  const Port::StringBase& LibraryDirectory() const { return libraryDirectory_; }
  const char* MappingFileName() const { return mappingFileName_; }
  // The exact contents Load writes into the mapping file.
  Port::StringBase MappingText() const { return MappingTextFor(EffectiveDirectory()); }

  // The maker's further device-family libraries, named in every mapping file.
  static constexpr std::array<const char*, 3> kFamilyLibraries = {"qlprim", "qlmacro", "qlio"};

  // "library=directory" and a line feed.
  static void AppendMapping(Port::StringBase& text, std::string_view library, std::string_view directory);
  // One line per library, mapping it to `folder` followed by its name.
  template <std::size_t N>
  static void AppendMappingsUnder(Port::StringBase& text, std::string_view folder,
                                  const std::array<const char*, N>& libraries) {
    for (const char* library : libraries) AppendMapping(text, library, Port::StringBase(folder) + library);
  }
  // The further libraries' lines that end both synthesis mapping files.
  static void AppendFurtherSynthesisLibraries(Port::StringBase& text);

 protected:
  CLibLoader(const char* libraryName, const char* mappingFileName, int nodeFileMode);

  // The data file whose presence says that `family` has a library of its own; "$CORVANE" and
  // relative names are resolved by Port_Env::GetDataFileName.
  virtual Port::StringBase FamilyTestFile(const Port::StringBase& family) const = 0;
  virtual Port::StringBase FamilyDirectory(const Port::StringBase& family) const = 0;
  virtual Port::StringBase DefaultDirectory() const = 0;
  virtual Port::StringBase MappingTextFor(const Port::StringBase& libraryDirectory) const = 0;

 private:
  Port::StringBase EffectiveDirectory() const;
  void WriteMappingFile() const;
  bool ReadComponents(CLibRefs& references) const;

  const Port::StringBase libraryName_;
  const char* const mappingFileName_;
  const int nodeFileMode_;
  Port::StringBase libraryDirectory_;
  CLibRefs* references_ = nullptr;  // not owned; the references of the last Load
};

// The one declaration of the maker's cell-library loaders. `Library` describes one library: its
// name, mapping file and node-file mode, and the four library-specific operations as static
// functions. Its file defines it and instantiates the loader; other files see the instantiation
// declared beside the loader's name.
template <class Library>
class TCellLibraryLoader final : public CLibLoader {
 public:
  TCellLibraryLoader();

 protected:
  Port::StringBase FamilyTestFile(const Port::StringBase& family) const override;
  Port::StringBase FamilyDirectory(const Port::StringBase& family) const override;
  Port::StringBase DefaultDirectory() const override;
  Port::StringBase MappingTextFor(const Port::StringBase& libraryDirectory) const override;
};

template <class Library>
TCellLibraryLoader<Library>::TCellLibraryLoader()
    : CLibLoader(Library::kName, Library::kMappingFile, Library::kNodeFileMode) {}

template <class Library>
Port::StringBase TCellLibraryLoader<Library>::FamilyTestFile(const Port::StringBase& family) const {
  return Library::FamilyTestFile(family);
}

template <class Library>
Port::StringBase TCellLibraryLoader<Library>::FamilyDirectory(const Port::StringBase& family) const {
  return Library::FamilyDirectory(family);
}

template <class Library>
Port::StringBase TCellLibraryLoader<Library>::DefaultDirectory() const {
  return Library::DefaultDirectory();
}

template <class Library>
Port::StringBase TCellLibraryLoader<Library>::MappingTextFor(const Port::StringBase& libraryDirectory) const {
  return Library::MappingTextFor(libraryDirectory);
}

}  // namespace Vad
