#include "CBasecellLoader.h"

#include "Port/InitObjects.h"
#include "rudiva/RudIva.h"

namespace Vad {

CBasecellLoader::CBasecellLoader() : CLibLoader("basecell", "chdp.ini", RudIva::kSynthesisLibraries) {}

Port::StringBase CBasecellLoader::FamilyTestFile(const Port::StringBase& family) const {
  Port::StringBase name;
  name.Format("../%s/vhdl/syn/basecell/arch.vho", family.c_str());
  return name;
}

Port::StringBase CBasecellLoader::FamilyDirectory(const Port::StringBase& family) const {
  Port::StringBase directory;
  directory.Format("$CORVANE/%s/vhdl/syn/basecell", family.c_str());
  return directory;
}

Port::StringBase CBasecellLoader::DefaultDirectory() const { return "$CORVANE/vhdl/syn/basecell"; }

Port::StringBase CBasecellLoader::MappingTextFor(const Port::StringBase& libraryDirectory) const {
  Port::StringBase text;
  AppendMapping(text, "std", "$CORVANE/vhdl/syn/std");
  AppendMapping(text, "ieee", "$CORVANE/vhdl/syn/ieee");
  AppendMapping(text, "basecell", libraryDirectory);
  AppendFurtherSynthesisLibraries(text);
  return text;
}

}  // namespace Vad
