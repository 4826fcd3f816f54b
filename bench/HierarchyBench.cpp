// The whole road (parse, hierarchy, compile order, freeing the tree) on shapes that used to grow
// far faster than their input: package diamonds (package k uses packages k-1 and k-2), whose
// hierarchy is shared subtrees, and chains of modules, entities and packages whose depth equals
// their length, at 1x, 2x and 4x. Each round makes a new project, so every round parses again.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <string>
#include <vector>

#include "BenchSupport.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "ICompAdmin.h"
#include "IHdlElaborationData.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "IHdlProject.h"
#include "Identifiers.h"
#include "Port/File.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"

namespace {

// Figures come from optimised builds; the checked builds only smoke-run the program on short chains.
#ifdef NDEBUG
constexpr int kChainUnit = 50000;
#else
constexpr int kChainUnit = 500;
#endif
constexpr int kUnitsPerFile = 1000;

enum ChainKind { kModules = 0, kEntities = 1, kPackages = 2 };

struct SourceFile {
  std::string name;
  std::string text;
};

std::vector<SourceFile> Diamond(int packages) {
  std::vector<SourceFile> files;
  for (int k = 0; k < packages; ++k) {
    std::string text;
    for (int used : {k - 1, k - 2}) {
      if (used >= 0) text += "use work.pkg_" + std::to_string(used) + ".all;\n";
    }
    text += "package pkg_" + std::to_string(k) + " is\n  constant c : integer := " + std::to_string(k) +
            ";\nend package;\n";
    files.push_back({"pkg_" + std::to_string(k) + ".vhd", std::move(text)});
  }
  return files;
}

std::string ChainUnit(ChainKind kind, int i, int length) {
  std::string self = std::to_string(i);
  std::string next = std::to_string(i + 1);
  bool last = i + 1 == length;
  switch (kind) {
    case kModules:
      return "module m" + self + ";\n" + (last ? "" : "  m" + next + " u ();\n") + "endmodule\n";
    case kEntities:
      return "entity e" + self + " is\nend entity;\narchitecture rtl of e" + self + " is\nbegin\n" +
             (last ? "" : "  u : entity work.e" + next + ";\n") + "end architecture;\n";
    case kPackages:
      return (last ? "" : "use work.p" + next + ".all;\n") + "package p" + self + " is\nend package;\n";
  }
  return {};
}

std::vector<SourceFile> Chain(ChainKind kind, int length) {
  std::vector<SourceFile> files;
  const char* extension = kind == kModules ? ".v" : ".vhd";
  for (int i = 0; i < length; ++i) {
    if (i % kUnitsPerFile == 0) files.push_back({"c" + std::to_string(i / kUnitsPerFile) + extension, {}});
    files.back().text += ChainUnit(kind, i, length);
  }
  return files;
}

// The files in a temporary directory of their own, removed when done.
class FilesOnDisk {
 public:
  explicit FilesOnDisk(const std::vector<SourceFile>& files) {
    Port::StringBase dir;
    if (!Port::File::mkdtemp(&dir)) return;
    dir_ = dir.str();
    for (const SourceFile& file : files) {
      std::string path = dir_ + "/" + file.name;
      std::FILE* out = std::fopen(path.c_str(), "wb");
      if (!out) continue;
      std::fwrite(file.text.data(), 1, file.text.size(), out);
      std::fclose(out);
      paths_.push_back(path);
    }
  }
  FilesOnDisk(const FilesOnDisk&) = delete;
  FilesOnDisk& operator=(const FilesOnDisk&) = delete;
  ~FilesOnDisk() {
    if (!dir_.empty()) Port::File::remove_r(dir_.c_str());
  }
  const std::vector<std::string>& paths() const { return paths_; }

 private:
  std::string dir_;
  std::vector<std::string> paths_;
};

Prjrep::AutoPtr<Vad::IHdlProject> NewProject(const std::vector<std::string>& paths) {
  auto project = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
  auto* fileSet = Prjrep::QueryAs<Vad::IHdlFileSet>(project.Get());
  if (!fileSet) return {};
  auto fileType = Host::FileType::Create("HDL", {"vhd", "v"});
  std::uint64_t orderKey = paths.size();
  for (const std::string& path : paths) {
    Prjrep::AutoPtr<Vad::IHdlFile> file;
    if (project->createNewFile(file.Out()) != CitI::kOk) return {};
    auto* admin = Prjrep::QueryAs<Vad::ICompAdmin>(file.Get());
    if (!admin || admin->InitializeAfterCreate(nullptr, fileType.Get()) != CitI::kOk) return {};
    file->setFilePath(Port::StringBase(path), Port::StringBase());
    bool verilog = path.ends_with(".v");
    file->setPluginName(Port::StringBase(verilog ? "PLUGIN_Verilog" : "PLUGIN_Vhdl"));
    // Verilog files are compiled in the order given.
    file->setOrderKey(orderKey--);
    fileSet->Add(file.Get());
  }
  return project;
}

// Parse, hierarchy and compile order; the project and its tree are freed inside the timing.
void RunRoad(benchmark::State& state, const FilesOnDisk& files) {
  bench::QuietMessages quiet;
  if (!bench::RegisterComponentsOnce() || files.paths().empty()) {
    state.SkipWithError("the files could not be written");
    return;
  }
  std::size_t ordered = 0;
  for (auto _ : state) {
    auto project = NewProject(files.paths());
    auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(project.Get());
    Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
    if (!elaboration || elaboration->getCompileOrder(nullptr, order.Out()) != CitI::kOk) {
      state.SkipWithError("no compile order");
      break;
    }
    for (ordered = 0; !order->IsDone(); order->Next()) ++ordered;
  }
  state.counters["files"] = static_cast<double>(ordered);
}

void BM_PackageDiamond(benchmark::State& state) {
  FilesOnDisk files(Diamond(static_cast<int>(state.range(0))));
  RunRoad(state, files);
}
BENCHMARK(BM_PackageDiamond)->Arg(20)->Arg(30)->Arg(40)->Arg(400)->Unit(benchmark::kMillisecond);

// Argument 0: the kind of chain; argument 1: its length in multiples of kChainUnit.
void BM_DeepChain(benchmark::State& state) {
  int length = kChainUnit * static_cast<int>(state.range(1));
  FilesOnDisk files(Chain(static_cast<ChainKind>(state.range(0)), length));
  RunRoad(state, files);
  state.counters["depth"] = length;
}
BENCHMARK(BM_DeepChain)
    ->ArgsProduct({{kModules, kEntities, kPackages}, {1, 2, 4}})
    ->Unit(benchmark::kMillisecond)
    ->Iterations(1);

}  // namespace
