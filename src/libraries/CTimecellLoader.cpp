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

CTimecellLoader::CTimecellLoader() : CLibLoader("timecell", "corvanesim.ini", RudIva::kSimulationLibraries) {}

Port::StringBase CTimecellLoader::FamilyTestFile(const Port::StringBase& family) const {
  Port::StringBase name;
  name.Format("$CORVANE/%s/vhdl/hdp/%s/timecell/arch.vho", family.c_str(), Port_Env::GetPlatformPath());
  return name;
}

Port::StringBase CTimecellLoader::FamilyDirectory(const Port::StringBase&) const {
  return DefaultDirectory();
}

Port::StringBase CTimecellLoader::DefaultDirectory() const {
  Port::StringBase directory;
  directory.Format("$CORVANE/vhdl/hdp/%s/timecell", Port_Env::GetPlatformPath());
  return directory;
}

Port::StringBase CTimecellLoader::MappingTextFor(const Port::StringBase&) const {
  Port::StringBase text;
  for (const char* library : {"std", "ieee", "synopsys", "timecell", "basecell"})
    AppendMapping(text, library, Port::StringBase("$CORVANE/vhdl/hdp/nt/") + library);
  AppendMappingsUnder(text, "$CORVANE/vhdl/hdp/nt/", kFamilyLibraries);
  AppendMapping(text, "corvanecorelib", "$CORVANE/vhdl/hdp/nt/corvanecorelib");
  AppendMappingsUnder(text, "$CORVANE/verilog/hdp/nt/", kSimulationVerilogLibraries);
  return text;
}

}  // namespace Vad
