// Speed of the Verilog data compiler on generated sources: MB/s for one large file, and the time to
// compile every file of a project after its prefix, as the Verilog parser does for each file.
#include <benchmark/benchmark.h>
#include <stdlib.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "SeededRandom.h"
#include "vci/Hx_Vci.h"
#include "vci/VerilogFileCache.h"

namespace {

// Verilog that looks like hand-written RTL: parameterised modules with ANSI ports, declarations,
// continuous assignments, clocked processes with case statements, instances of earlier modules
// with parameter overrides, generate loops, comments, an include and a few project-wide macros.
class VerilogGenerator {
 public:
  explicit VerilogGenerator(std::uint64_t seed) : random_(seed) {}

  std::string Module(int index, int earlierModules) {
    const std::string name = NameOf(index);
    std::string text;
    text += "// ----------------------------------------------------------------------------\n";
    text += "// " + name + ": datapath block " + std::to_string(index) + " of the generated design.\n";
    text += "// ----------------------------------------------------------------------------\n";
    text += "`timescale 1ns / 1ps\n";
    if (index % 4 == 0) text += "`include \"common_defs.vh\"\n";
    if (index % 10 == 0) {
      text += "`define " + MacroOf(index) + " " + std::to_string(8 + Below(24)) + "\n";
    }
    text += "\nmodule " + name + " #(\n  parameter WIDTH = 16,\n  parameter DEPTH = 4\n) (\n";
    text += "  input  wire             clk,\n  input  wire             rst_n,\n";
    const int ports = 2 + Below(4);
    for (int p = 0; p < ports; ++p) text += "  input  wire [WIDTH-1:0] din_" + std::to_string(p) + ",\n";
    for (int p = 0; p < ports; ++p) {
      text += "  output reg  [WIDTH-1:0] dout_" + std::to_string(p) + (p + 1 < ports ? ",\n" : "\n");
    }
    text += ");\n\n  // internal signals\n";
    const int signals = 6 + Below(10);
    for (int s = 0; s < signals; ++s) text += "  wire [WIDTH-1:0] s_" + std::to_string(s) + ";\n";
    text += "  reg  [7:0]       cnt;\n  genvar g;\n\n";
    for (int s = 0; s < signals; ++s) {
      text += "  assign s_" + std::to_string(s) + " = din_" + std::to_string(Below(ports)) + " ^ {WIDTH{s_" +
              std::to_string(Below(signals)) + "[0]}}; /* mix */\n";
    }
    for (int p = 0; p < ports; ++p) AppendProcess(&text, p, signals);
    if (earlierModules > 0) {
      const int instances = 1 + Below(4);
      for (int i = 0; i < instances; ++i) AppendInstance(&text, index, Below(earlierModules), i, signals);
      if (Below(3) == 0) {
        text += "\n  generate\n    for (g = 0; g < DEPTH; g = g + 1) begin : g_lane\n";
        text += "      " + NameOf(Below(earlierModules)) +
                " #(.WIDTH(WIDTH)) u_lane (.clk(clk), .rst_n(rst_n), .din_0(s_0), .dout_0());\n";
        text += "    end\n  endgenerate\n";
      }
    }
    text += "endmodule\n\n";
    return text;
  }

  static std::string NameOf(int index) { return "blk_" + std::to_string(index); }

 private:
  static std::string MacroOf(int index) { return "BLK" + std::to_string(index) + "_WIDTH"; }

  void AppendProcess(std::string* text, int port, int signals) {
    const std::string out = "dout_" + std::to_string(port);
    *text += "\n  always @(posedge clk or negedge rst_n) begin\n    if (!rst_n) begin\n";
    *text += "      " + out + " <= {WIDTH{1'b0}};\n      cnt <= 8'd0;\n    end else begin\n";
    *text += "      case (cnt[1:0])\n";
    *text += "        2'd0: " + out + " <= s_" + std::to_string(Below(signals)) + ";\n";
    *text += "        2'd1: " + out + " <= s_" + std::to_string(Below(signals)) + " + 1'b1;\n";
    *text += "        2'd2: " + out + " <= " + out + " >> 1;\n";
    *text += "        default: " + out + " <= " + out + ";\n      endcase\n";
    *text += "      cnt <= cnt + 1'b1;\n    end\n  end\n";
  }

  void AppendInstance(std::string* text, int index, int child, int number, int signals) {
    std::string width = "WIDTH";
    if (index >= 20 && Below(2) == 0) width = std::string("`").append(MacroOf(Below(index / 10) * 10));
    *text += "\n  " + NameOf(child) + " #(.WIDTH(" + width + "), .DEPTH(" + std::to_string(2 + Below(6)) +
             ")) u_" + NameOf(child) + "_" + std::to_string(number) + " (\n";
    *text += "    .clk   (clk),\n    .rst_n (rst_n),\n";
    *text += "    .din_0 (s_" + std::to_string(Below(signals)) + "),\n";
    *text += "    .dout_0(s_" + std::to_string(Below(signals)) + ")\n  );\n";
  }

  int Below(int bound) { return random_.Below(bound); }

  SeededRandom random_;
};

constexpr char kCommonDefs[] =
    "`ifndef COMMON_DEFS_VH\n"
    "`define COMMON_DEFS_VH\n"
    "`define RESET_VALUE 0\n"
    "`define MAX(a, b) ((a) > (b) ? (a) : (b))\n"
    "`endif\n";

class TempDirectory {
 public:
  TempDirectory() {
    std::string pattern = (std::filesystem::temp_directory_path() / "vcibenchXXXXXX").string();
    path_ = mkdtemp(pattern.data()) != nullptr ? pattern : std::string();
  }
  TempDirectory(const TempDirectory&) = delete;
  TempDirectory& operator=(const TempDirectory&) = delete;
  ~TempDirectory() {
    std::error_code ignored;
    if (!path_.empty()) std::filesystem::remove_all(path_, ignored);
  }
  std::string Write(const std::string& name, const std::string& text) const {
    const std::string path = path_ + "/" + name;
    std::ofstream(path, std::ios::binary) << text;
    return path;
  }

 private:
  std::string path_;
};

// A generated project on disk: the files in project order, and their total size.
struct Project {
  TempDirectory directory;
  std::vector<std::string> files;
  std::uint64_t bytes = 0;
};

std::unique_ptr<Project> MakeProject(int fileCount) {
  auto project = std::make_unique<Project>();
  project->directory.Write("common_defs.vh", kCommonDefs);
  VerilogGenerator generator(20240611);
  for (int i = 0; i < fileCount; ++i) {
    const std::string text = generator.Module(i, i);
    project->bytes += text.size();
    project->files.push_back(project->directory.Write(VerilogGenerator::NameOf(i) + ".v", text));
  }
  return project;
}

// Walks the result the way the Verilog parser does; answers the number of objects seen.
long WalkDesign(const Hx_VpiAccess& access) {
  long seen = 0;
  Hx_VpiIteratorPtr modules = access.iterate(vpiModule, nullptr);
  while (Hx_VpiHandlePtr module = access.scan(modules)) {
    seen += access.get(vpiLineNo, module) > 0;
    Hx_VpiHandlePtr firstPort = access.scan(access.iterate(vpiPort, module));
    seen += !access.get_str(vpiName, access.handle(vpiLowConn, firstPort)).empty();
    Hx_VpiIteratorPtr instances = access.iterate(vpiModule, module);
    while (Hx_VpiHandlePtr instance = access.scan(instances)) {
      seen += !access.get_str(vpiDefName, instance).empty() + !access.get_str(vpiName, instance).empty();
    }
  }
  return seen;
}

void BM_VerilogCompileLargeFile(benchmark::State& state) {
  TempDirectory directory;
  directory.Write("common_defs.vh", kCommonDefs);
  VerilogGenerator generator(7);
  std::string text;
  for (int i = 0; text.size() < static_cast<std::size_t>(state.range(0)) << 20; ++i) {
    text += generator.Module(i, i);
  }
  const std::string path = directory.Write("large.v", text);
  const char* argv[] = {"commandname", path.c_str(), "+dora+dataparser+CR172701"};
  long seen = 0;
  for (auto _ : state) {
    Hx_Vci::DataCompiler compiler(std::make_shared<Hx_Vci::VerilogFileCache>());  // nothing cached
    std::unique_ptr<Hx_VpiAccess> access = compiler.compile(3, argv);
    seen = access ? WalkDesign(*access) : -1;
    benchmark::DoNotOptimize(seen);
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * text.size()));
  state.counters["objects"] = static_cast<double>(seen);
}
BENCHMARK(BM_VerilogCompileLargeFile)->Arg(16)->Unit(benchmark::kMillisecond);

// Every file compiled after all the files before it, each by a compiler of its own as the parser
// makes one per parse; the cache they share is new for every round.
void BM_VerilogCompileProjectPrefixes(benchmark::State& state) {
  const std::unique_ptr<Project> project = MakeProject(static_cast<int>(state.range(0)));
  std::vector<const char*> argv{"commandname"};
  std::uint64_t scanned = 0;
  for (auto _ : state) {
    auto cache = std::make_shared<Hx_Vci::VerilogFileCache>();
    long seen = 0;
    for (std::size_t k = 1; k <= project->files.size(); ++k) {
      argv.resize(1);
      for (std::size_t i = 0; i < k; ++i) argv.push_back(project->files[i].c_str());
      argv.push_back("+dora+dataparser+CR172701");
      Hx_Vci::DataCompiler compiler(cache);
      std::unique_ptr<Hx_VpiAccess> access = compiler.compile(static_cast<int>(argv.size()), argv.data());
      seen += access ? WalkDesign(*access) : 0;
    }
    benchmark::DoNotOptimize(seen);
    scanned = cache->ScannedFileCount();
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * project->bytes));
  state.counters["files"] = static_cast<double>(project->files.size());
  state.counters["scanned"] = static_cast<double>(scanned);
  state.counters["us_per_file"] =
      benchmark::Counter(static_cast<double>(project->files.size()) * 1e-6,
                         benchmark::Counter::kIsIterationInvariantRate | benchmark::Counter::kInvert);
}
BENCHMARK(BM_VerilogCompileProjectPrefixes)->Arg(500)->Arg(1000)->Arg(2000)->Unit(benchmark::kMillisecond);

}  // namespace
