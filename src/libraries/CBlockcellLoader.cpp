#include "CBlockcellLoader.h"

#include "Port/InitObjects.h"
#include "rudiva/RudIva.h"

namespace Vad {

struct BlockcellLibrary {
  static constexpr const char* kName = "blockcell";
  static constexpr const char* kMappingFile = "chdp.ini";
  static constexpr int kNodeFileMode = RudIva::kSynthesisLibraries;

  static Port::StringBase FamilyTestFile(const Port::StringBase& family) {
    Port::StringBase name;
    name.Format("../%s/vhdl/syn/blockcell/arch.vho", family.c_str());
    return name;
  }

  static Port::StringBase FamilyDirectory(const Port::StringBase& family) {
    Port::StringBase directory;
    directory.Format("$CORVANE/%s/vhdl/syn/blockcell", family.c_str());
    return directory;
  }

  static Port::StringBase DefaultDirectory() { return "$CORVANE/vhdl/syn/blockcell"; }

  // The macros are built from the unified cells, so the unified library is named beside them.
  static Port::StringBase MappingTextFor(const Port::StringBase& libraryDirectory) {
    Port::StringBase text;
    CLibLoader::AppendMapping(text, "std", "$CORVANE/vhdl/syn/std");
    CLibLoader::AppendMapping(text, "ieee", "$CORVANE/vhdl/syn/ieee");
    CLibLoader::AppendMapping(text, "blockcell", libraryDirectory);
    CLibLoader::AppendMapping(text, "basecell", "$CORVANE/vhdl/syn/basecell");
    CLibLoader::AppendFurtherSynthesisLibraries(text);
    return text;
  }
};

template class TCellLibraryLoader<BlockcellLibrary>;

}  // namespace Vad
