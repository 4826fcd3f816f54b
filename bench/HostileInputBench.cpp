// Inputs that once made the work grow faster than the input: many copies of one unit name, many
// sibling blocks of a netlist database, include fan-out. Each should grow linearly in N.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <string>

#include "BenchSupport.h"
#include "CHdlFile.h"
#include "CParserConfigHolder.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "ICompAdmin.h"
#include "IHdlFile.h"
#include "IHdlProject.h"
#include "Identifiers.h"
#include "Port/File.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"

namespace {

// Files of one generated input in a directory of their own, the last one in a project.
class InputProject {
 public:
  InputProject() {
    bench::RegisterComponentsOnce();
    Port::StringBase dir;
    if (Port::File::mkdtemp(&dir)) dir_ = dir.str();
  }
  InputProject(const InputProject&) = delete;
  InputProject& operator=(const InputProject&) = delete;
  ~InputProject() {
    if (!dir_.empty()) Port::File::remove_r(dir_.c_str());
  }

  std::string Write(const std::string& name, const std::string& text) const {
    const std::string path = dir_ + "/" + name;
    if (std::FILE* out = std::fopen(path.c_str(), "wb")) {
      std::fwrite(text.data(), 1, text.size(), out);
      std::fclose(out);
    }
    return path;
  }

  // Parses the file as the plug-in's source; the number of units recorded.
  std::size_t Parse(const std::string& path, const char* plugin) const {
    auto project = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
    Prjrep::AutoPtr<Vad::IHdlFile> file;
    if (!project || project->createNewFile(file.Out()) != CitI::kOk) return 0;
    auto fileType = Host::FileType::Create("HDL", {"vhd", "v"});
    Prjrep::QueryAs<Vad::ICompAdmin>(file.Get())->InitializeAfterCreate(nullptr, fileType.Get());
    file->setFilePath(Port::StringBase(path), Port::StringBase());
    file->setPluginName(Port::StringBase(plugin));
    if (auto* v3 = Prjrep::QueryAs<Vad::IHdlFileV3>(file.Get())) v3->setV3Flag(true);
    Prjrep::QueryAs<Vad::IHdlFileSet>(project.Get())->Add(file.Get());
    Vad::CParserConfigHolder* holder = Prjrep::ObjectCast<Vad::CHdlFile>(file.Get())->GetHolder();
    holder->Parse(nullptr);
    return holder->GetUnitSet()->GetCount();
  }

 private:
  std::string dir_;
};

void BM_CopiesOfOneEntity(benchmark::State& state) {
  bench::QuietMessages quiet;
  InputProject input;
  std::string text;
  for (int64_t copy = 0; copy < state.range(0); ++copy) text += "entity twin is end;\n";
  const std::string path = input.Write("twins.vhd", text);
  for (auto _ : state) benchmark::DoNotOptimize(input.Parse(path, "PLUGIN_Vhdl"));
  state.SetComplexityN(state.range(0));
}
BENCHMARK(BM_CopiesOfOneEntity)->Arg(2000)->Arg(10000)->Unit(benchmark::kMillisecond)->Complexity();

void BM_SiblingBlocksOfANetlistDatabase(benchmark::State& state) {
  bench::QuietMessages quiet;
  InputProject input;
  std::string blocks;
  for (int64_t block = 0; block < state.range(0); ++block) {
    blocks +=
        std::string(block ? "," : "") + R"({"name": "b)" + std::to_string(block) + R"(", "properties": {}})";
  }
  const std::string path = input.Write(
      "wide.pdb",
      R"({"format": "quillon-netlist", "version": 1, "designs": [{"name": "chip", "properties": {}, )"
      R"("views": [{"name": "SOURCE", "block": {"name": "top", "properties": {"TYPE": "t"}, "blocks": [)" +
          blocks + "]}}]}]}");
  for (auto _ : state) benchmark::DoNotOptimize(input.Parse(path, "PLUGIN_PLX"));
  state.SetComplexityN(state.range(0));
}
BENCHMARK(BM_SiblingBlocksOfANetlistDatabase)
    ->Arg(50000)
    ->Arg(200000)
    ->Unit(benchmark::kMillisecond)
    ->Complexity();

void BM_IncludeFanOut(benchmark::State& state) {
  bench::QuietMessages quiet;
  InputProject input;
  const int levels = static_cast<int>(state.range(0));
  for (int level = 0; level < levels; ++level) {
    const std::string next = "h" + std::to_string(level + 1) + ".vh";
    input.Write("h" + std::to_string(level) + ".vh",
                "`include \"" + next + "\"\n`include \"" + next + "\"\n");
  }
  input.Write("h" + std::to_string(levels) + ".vh", "");
  const std::string path = input.Write("fan.v", "`include \"h0.vh\"\nmodule after; endmodule\n");
  for (auto _ : state) benchmark::DoNotOptimize(input.Parse(path, "PLUGIN_Verilog"));
}
BENCHMARK(BM_IncludeFanOut)->Arg(14)->Arg(18)->Unit(benchmark::kMillisecond);

}  // namespace
