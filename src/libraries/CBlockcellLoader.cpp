#include "CBlockcellLoader.h"

#include "Port/InitObjects.h"
#include "rudiva/RudIva.h"

namespace Vad {

CBlockcellLoader::CBlockcellLoader() : CLibLoader("blockcell", "chdp.ini", RudIva::kSynthesisLibraries) {}

Port::StringBase CBlockcellLoader::FamilyTestFile(const Port::StringBase& family) const {
  Port::StringBase name;
  name.Format("../%s/vhdl/syn/blockcell/arch.vho", family.c_str());
  return name;
}

Port::StringBase CBlockcellLoader::FamilyDirectory(const Port::StringBase& family) const {
  Port::StringBase directory;
  directory.Format("$CORVANE/%s/vhdl/syn/blockcell", family.c_str());
  return directory;
}

Port::StringBase CBlockcellLoader::DefaultDirectory() const { return "$CORVANE/vhdl/syn/blockcell"; }

// The macros are built from the unified cells, so the unified library is named beside them.
Port::StringBase CBlockcellLoader::MappingTextFor(const Port::StringBase& libraryDirectory) const {
  Port::StringBase text;
  AppendMapping(text, "std", "$CORVANE/vhdl/syn/std");
  AppendMapping(text, "ieee", "$CORVANE/vhdl/syn/ieee");
  AppendMapping(text, "blockcell", libraryDirectory);
  AppendMapping(text, "basecell", "$CORVANE/vhdl/syn/basecell");
  AppendFurtherSynthesisLibraries(text);
  return text;
}

}  // namespace Vad
