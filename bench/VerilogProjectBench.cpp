// Speed of the Verilog parser on the road a host takes: generated Verilog projects of 500, 1,000 and
// 2,000 files parsed through the project (getAllDesignUnits), every file compiled after all the
// files before it; the same with only the parser's own calls timed; and one large file, for the
// bytes per second. The files are written once; every round starts with an empty compile cache
// and a new project, so nothing that an earlier round compiled is found again. Only the parse is
// timed.
#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "BenchSupport.h"
#include "CHdlFile.h"
#include "CParserConfigHolder.h"
#include "CProjectFileList.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "ICompAdmin.h"
#include "IHdlFile.h"
#include "IHdlProject.h"
#include "Identifiers.h"
#include "Port/File.h"
#include "Port/MsgDispatcher.h"
#include "Port/MsgManDefault.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "SeededRandom.h"
#include "VerilogParser.h"
#include "vci/VerilogFileCache.h"

namespace {

constexpr std::uint64_t kProjectSeed = 20250302;

struct GeneratedFile {
  std::string name;
  std::string text;
};

// RTL-like Verilog with a fixed seed: one module a file, ANSI or non-ANSI ports, declarations,
// continuous assignments, clocked processes, instances of modules of earlier files with parameter
// overrides (some in generate loops, some two to a statement), attributes, comments and strings.
// Every tenth file defines a width macro that later files use; every sixth includes a shared header
// whose macros the files after it use.
class VerilogProjectGenerator {
 public:
  static constexpr const char* kHeaderName = "bench_defs.vh";
  static constexpr const char* kHeader =
      "`ifndef BENCH_DEFS_VH\n"
      "`define BENCH_DEFS_VH\n"
      "`define BUS_WIDTH 32\n"
      "`define PICK(sel, a, b) ((sel) ? (a) : (b))\n"
      "`endif\n";

  explicit VerilogProjectGenerator(std::uint64_t seed) : random_(seed) {}

  std::vector<GeneratedFile> Project(int fileCount) {
    std::vector<GeneratedFile> files;
    files.reserve(static_cast<std::size_t>(fileCount));
    for (int i = 0; i < fileCount; ++i) files.push_back({ModuleName(i) + ".v", File(i, i % 6 == 0)});
    return files;
  }

  // Modules enough for `bytes` bytes, in one text that includes the header once.
  std::string LargeText(std::size_t bytes) {
    std::string text;
    for (int i = 0; text.size() < bytes; ++i) text += File(i, i == 0);
    return text;
  }

  static std::string ModuleName(int index) { return "unit_" + std::to_string(index); }

 private:
  std::string File(int index, bool includeHeader) {
    std::string text = "/*\n * " + ModuleName(index) + " -- generated block " + std::to_string(index) +
                       "\n * Do not edit by hand.\n */\n`timescale 1ns/1ps\n";
    if (includeHeader) text += std::string("`include \"") + kHeaderName + "\"\n";
    if (index % 10 == 0) text += "`define " + WidthMacro(index) + " " + std::to_string(4 + Below(28)) + "\n";
    const int ports = 2 + Below(5);
    if (Below(4) == 0) {
      AppendNonAnsiHeader(text, index, ports);
    } else {
      AppendAnsiHeader(text, index, ports);
    }
    AppendBody(text, ports);
    if (index > 0) AppendInstances(text, index);
    text += "endmodule // " + ModuleName(index) + "\n";
    return text;
  }

  void AppendAnsiHeader(std::string& text, int index, int ports) {
    text += "(* keep_hierarchy = \"yes\" *)\nmodule " + ModuleName(index) +
            " #(parameter W = 8, parameter N = 2) (\n  input wire clk,\n  input wire rst,\n";
    for (int p = 0; p < ports; ++p) {
      text += "  input wire [W-1:0] a" + std::to_string(p) + ",\n";
    }
    for (int p = 0; p < ports; ++p) {
      text += "  output reg [W-1:0] y" + std::to_string(p) + (p + 1 < ports ? ",\n" : "\n);\n");
    }
  }

  void AppendNonAnsiHeader(std::string& text, int index, int ports) {
    text += "module " + ModuleName(index) + " (clk, rst";
    for (int p = 0; p < ports; ++p) text += ", a" + std::to_string(p) + ", y" + std::to_string(p);
    text += ");\n  parameter W = 8;\n  parameter N = 2;\n  input clk, rst;\n";
    for (int p = 0; p < ports; ++p) {
      text +=
          "  input [W-1:0] a" + std::to_string(p) + ";\n  output reg [W-1:0] y" + std::to_string(p) + ";\n";
    }
  }

  void AppendBody(std::string& text, int ports) {
    const int wires = 4 + Below(8);
    for (int w = 0; w < wires; ++w) text += "  wire [W-1:0] t" + std::to_string(w) + ";\n";
    for (int w = 0; w < wires; ++w) {
      const std::string sum = "a" + std::to_string(Below(ports)) + " + t" + std::to_string(Below(wires));
      const std::string value =
          Below(4) == 0 ? "`PICK(rst, {W{1'b0}}, " + sum + ")" : "rst ? {W{1'b0}} : " + sum;
      text += "  assign t" + std::to_string(w) + " = " + value + "; // lane " + std::to_string(w) + "\n";
    }
    for (int p = 0; p < ports; ++p) {
      const std::string y = "y" + std::to_string(p);
      text += "  always @(posedge clk) begin\n    if (rst) " + y + " <= 0;\n    else case (t0[1:0])\n";
      text += "      2'b00: " + y + " <= t" + std::to_string(Below(wires)) + ";\n";
      text += "      2'b01: " + y + " <= " + y + " ^ t" + std::to_string(Below(wires)) + ";\n";
      text += "      default: " + y + " <= {" + y + "[W-2:0], 1'b0};\n    endcase\n  end\n";
    }
    text += "  initial $display(\"%m: W=%0d (\\\"generated\\\")\", W);\n";
  }

  void AppendInstances(std::string& text, int index) {
    const int instances = 1 + Below(3);
    for (int i = 0; i < instances; ++i) {
      const int child = Below(index);
      const std::string width = index > 10 && Below(3) == 0 ? "`" + WidthMacro(Below(index / 10) * 10) : "W";
      text += "  " + ModuleName(child) + " #(.W(" + width + "), .N(" + std::to_string(1 + Below(4)) + ")) u" +
              std::to_string(i) + " (.clk(clk), .rst(rst), .a0(t0), .y0())";
      if (Below(4) == 0) text += ", u" + std::to_string(i) + "_twin (.clk(clk), .rst(rst))";
      text += ";\n";
    }
    if (Below(5) == 0) {
      text += "  genvar g;\n  generate for (g = 0; g < N; g = g + 1) begin : lanes\n    " +
              ModuleName(Below(index)) + " #(.W(W)) lane (.clk(clk), .rst(rst));\n  end endgenerate\n";
    }
  }

  static std::string WidthMacro(int index) { return "UNIT" + std::to_string(index) + "_W"; }

  int Below(int bound) { return random_.Below(bound); }

  SeededRandom random_;
};

// A new temporary directory holding the given files, removed with them.
class FilesOnDisk {
 public:
  explicit FilesOnDisk(const std::vector<GeneratedFile>& files) {
    Port::StringBase dir;
    if (!Port::File::mkdtemp(&dir)) return;
    dir_ = dir.str();
    ok_ = Write(VerilogProjectGenerator::kHeaderName, VerilogProjectGenerator::kHeader);
    for (const GeneratedFile& file : files) {
      ok_ = ok_ && Write(file.name, file.text);
      paths_.push_back(dir_ + "/" + file.name);
    }
  }
  FilesOnDisk(const FilesOnDisk&) = delete;
  FilesOnDisk& operator=(const FilesOnDisk&) = delete;
  ~FilesOnDisk() {
    if (!dir_.empty()) Port::File::remove_r(dir_.c_str());
  }

  bool ok() const { return ok_ && !dir_.empty(); }
  const std::vector<std::string>& paths() const { return paths_; }

 private:
  bool Write(const std::string& name, const std::string& text) const {
    std::FILE* out = std::fopen((dir_ + "/" + name).c_str(), "wb");
    if (!out) return false;
    bool written = std::fwrite(text.data(), 1, text.size(), out) == text.size();
    return std::fclose(out) == 0 && written;
  }

  std::string dir_;
  std::vector<std::string> paths_;
  bool ok_ = false;
};

// A project of the Verilog files at `paths`, added as a host adds them: plug-in, V3 flag, and
// order keys that put them in the given order.
class VerilogProject {
 public:
  explicit VerilogProject(const std::vector<std::string>& paths) {
    project_ = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
    auto* fileSet = Prjrep::QueryAs<Vad::IHdlFileSet>(project_.Get());
    auto fileType = Host::FileType::Create("HDL", {"v"});
    std::uint64_t orderKey = paths.size();
    for (const std::string& path : paths) {
      Prjrep::AutoPtr<Vad::IHdlFile> file;
      if (!fileSet || project_->createNewFile(file.Out()) != CitI::kOk) {
        Fail();
        return;
      }
      auto* admin = Prjrep::QueryAs<Vad::ICompAdmin>(file.Get());
      auto* v3 = Prjrep::QueryAs<Vad::IHdlFileV3>(file.Get());
      if (!admin || !v3 || admin->InitializeAfterCreate(nullptr, fileType.Get()) != CitI::kOk) {
        Fail();
        return;
      }
      file->setFilePath(Port::StringBase(path), Port::StringBase());
      file->setPluginName(Port::StringBase("PLUGIN_Verilog"));
      file->setOrderKey(orderKey--);
      v3->setV3Flag(true);
      fileSet->Add(file.Get());
      files_.push_back(file.Get());
    }
  }

  bool ok() const { return static_cast<bool>(project_); }
  Vad::IHdlProject* project() const { return project_.Get(); }
  // In project order.
  const std::vector<Vad::IHdlFile*>& files() const { return files_; }

 private:
  void Fail() {
    files_.clear();
    project_ = nullptr;
  }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  std::vector<Vad::IHdlFile*> files_;  // kept alive by the project
};

std::uint64_t SizeOf(const std::vector<GeneratedFile>& files) {
  std::uint64_t bytes = 0;
  for (const GeneratedFile& file : files) bytes += file.text.size();
  return bytes;
}

// What one round measured: the seconds that count, or what went wrong.
struct Outcome {
  double seconds = 0;
  const char* error = nullptr;
};

// Rounds on a new project each, parsed by `parse`.
template <class ParseProject>
void ParseRounds(benchmark::State& state, const std::vector<GeneratedFile>& files, ParseProject parse) {
  bench::QuietMessages quiet;
  if (!bench::RegisterComponentsOnce()) {
    state.SkipWithError("the registry could not be set up");
    return;
  }
  const FilesOnDisk onDisk(files);
  if (!onDisk.ok()) {
    state.SkipWithError("the project could not be written");
    return;
  }
  for (auto _ : state) {
    Hx_Vci::VerilogFileCache::Shared()->Clear();
    auto project = std::make_unique<VerilogProject>(onDisk.paths());
    if (!project->ok()) {
      state.SkipWithError("the project could not be set up");
      return;
    }
    const Outcome outcome = parse(*project);
    project.reset();
    if (outcome.error) {
      state.SkipWithError(outcome.error);
      return;
    }
    state.SetIterationTime(outcome.seconds);
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * SizeOf(files)));
  state.counters["files"] = static_cast<double>(files.size());
  if (files.size() > 1) {
    state.counters["us_per_file"] =
        benchmark::Counter(static_cast<double>(files.size()) * 1e-6,
                           benchmark::Counter::kIsIterationInvariantRate | benchmark::Counter::kInvert);
  }
}

double SecondsSince(std::chrono::steady_clock::time_point start) {
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

// The whole road: the project brings every file up to date.
Outcome ParseThroughProject(const VerilogProject& onDisk) {
  const auto start = std::chrono::steady_clock::now();
  Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
  const bool parsed = onDisk.project()->getAllDesignUnits(units.Out()) == CitI::kOk;
  const double seconds = SecondsSince(start);
  if (!parsed || units->GetCount() < onDisk.files().size()) return {0, "not every module was recorded"};
  return {seconds};
}

// The Verilog parser's share of the road: only its Parse calls count, each given the sibling list
// that the project hands out (the holder's own work before and after a parse is left out). The
// generated files must compile without any message.
Outcome ParseWithTheParserAlone(const VerilogProject& onDisk) {
  auto projectFiles = Vad::CProjectFileList::New(onDisk.files());
  Outcome outcome;
  for (Vad::IHdlFile* file : onDisk.files()) {
    Vad::CParserConfigHolder* holder = Prjrep::ObjectCast<Vad::CHdlFile>(file)->GetHolder();
    holder->BeginParse(projectFiles.Get());
    const auto start = std::chrono::steady_clock::now();
    auto parser = std::make_unique<Vad::VerilogParser>();
    parser->Parse(*holder);
    outcome.seconds += SecondsSince(start);
    holder->EndParse();
    if (!parser->CapturedMessages().IsEmpty()) return {0, "the generated Verilog gave messages"};
    if (holder->GetUnitCount() == 0) return {0, "a file recorded no module"};
  }
  return outcome;
}

// One file of `range(0)` MB parsed through a project of its own. Registered first: the rounds of
// the projects leave the process cache full of results of files since deleted, which slows the
// allocator for whatever runs after them.
void BM_VerilogSingleFileParse(benchmark::State& state) {
  const std::size_t bytes = static_cast<std::size_t>(state.range(0)) << 20;
  ParseRounds(state, {{"large.v", VerilogProjectGenerator(kProjectSeed).LargeText(bytes)}},
              ParseThroughProject);
}
BENCHMARK(BM_VerilogSingleFileParse)->Arg(16)->UseManualTime()->Unit(benchmark::kMillisecond);

void BM_VerilogProjectParse(benchmark::State& state) {
  ParseRounds(state, VerilogProjectGenerator(kProjectSeed).Project(static_cast<int>(state.range(0))),
              ParseThroughProject);
}
BENCHMARK(BM_VerilogProjectParse)
    ->Arg(500)
    ->Arg(1000)
    ->Arg(2000)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

void BM_VerilogParserShareOfProjectParse(benchmark::State& state) {
  ParseRounds(state, VerilogProjectGenerator(kProjectSeed).Project(static_cast<int>(state.range(0))),
              ParseWithTheParserAlone);
}
BENCHMARK(BM_VerilogParserShareOfProjectParse)
    ->Arg(500)
    ->Arg(1000)
    ->Arg(2000)
    ->UseManualTime()
    ->Unit(benchmark::kMillisecond);

}  // namespace
