#include "CBasecellLoader.h"

#include "Port/InitObjects.h"
#include "rudiva/RudIva.h"

namespace Vad {

struct BasecellLibrary {
  static constexpr const char* kName = "basecell";
  static constexpr const char* kMappingFile = "chdp.ini";
  static constexpr int kNodeFileMode = RudIva::kSynthesisLibraries;

  static Port::StringBase FamilyTestFile(const Port::StringBase& family) {
    Port::StringBase name;
    name.Format("../%s/vhdl/syn/basecell/arch.vho", family.c_str());
    return name;
  }

  static Port::StringBase FamilyDirectory(const Port::StringBase& family) {
    Port::StringBase directory;
    directory.Format("$CORVANE/%s/vhdl/syn/basecell", family.c_str());
    return directory;
  }

  static Port::StringBase DefaultDirectory() { return "$CORVANE/vhdl/syn/basecell"; }

  static Port::StringBase MappingTextFor(const Port::StringBase& libraryDirectory) {
    Port::StringBase text;
    CLibLoader::AppendMapping(text, "std", "$CORVANE/vhdl/syn/std");
    CLibLoader::AppendMapping(text, "ieee", "$CORVANE/vhdl/syn/ieee");
    CLibLoader::AppendMapping(text, "basecell", libraryDirectory);
    CLibLoader::AppendFurtherSynthesisLibraries(text);
    return text;
  }
};

template class TCellLibraryLoader<BasecellLibrary>;

}  // namespace Vad
