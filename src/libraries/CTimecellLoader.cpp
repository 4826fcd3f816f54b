#include "CTimecellLoader.h"

#include <array>

#include "Port/Env.h"
#include "Port/InitObjects.h"
#include "rudiva/RudIva.h"

namespace Vad {
namespace {

constexpr std::array<const char*, 5> kSimulationVerilogLibraries = {"timecell_ver", "basecell_ver",
                                                                    "qlprim_ver", "qlmacro_ver", "qlio_ver"};

}  // namespace

struct TimecellLibrary {
  static constexpr const char* kName = "timecell";
  static constexpr const char* kMappingFile = "corvanesim.ini";
  static constexpr int kNodeFileMode = RudIva::kSimulationLibraries;

  static Port::StringBase FamilyTestFile(const Port::StringBase& family) {
    Port::StringBase name;
    name.Format("$CORVANE/%s/vhdl/hdp/%s/timecell/arch.vho", family.c_str(), Port_Env::GetPlatformPath());
    return name;
  }

  static Port::StringBase FamilyDirectory(const Port::StringBase&) { return DefaultDirectory(); }

  static Port::StringBase DefaultDirectory() {
    Port::StringBase directory;
    directory.Format("$CORVANE/vhdl/hdp/%s/timecell", Port_Env::GetPlatformPath());
    return directory;
  }

  // The simulation mapping names the libraries under the fixed "nt" folder whatever the
  // platform, so the library directory does not enter it.
  static Port::StringBase MappingTextFor(const Port::StringBase&) {
    Port::StringBase text;
    for (const char* library : {"std", "ieee", "synopsys", "timecell", "basecell"})
      CLibLoader::AppendMapping(text, library, Port::StringBase("$CORVANE/vhdl/hdp/nt/") + library);
    CLibLoader::AppendMappingsUnder(text, "$CORVANE/vhdl/hdp/nt/", CLibLoader::kFamilyLibraries);
    CLibLoader::AppendMapping(text, "corvanecorelib", "$CORVANE/vhdl/hdp/nt/corvanecorelib");
    CLibLoader::AppendMappingsUnder(text, "$CORVANE/verilog/hdp/nt/", kSimulationVerilogLibraries);
    return text;
  }
};

template class TCellLibraryLoader<TimecellLibrary>;

}  // namespace Vad
