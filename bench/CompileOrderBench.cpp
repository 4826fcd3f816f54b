// Speed of the compile order on a generated project of 10,000 VHDL files (optimised builds): the elaborator's
// GetCompileOrder alone over a built hierarchy tree, and the whole road a host takes from adding
// the files to the order (parse, elaboration, tree, order). Argument 0: an acyclic project;
// argument 1: some designs also instantiate their grandparent, so the strict rule meets file
// cycles and the relaxed rule is built as well.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <string>
#include <vector>

#include "BenchSupport.h"
#include "CCompileOrder.h"
#include "CElaborator.h"
#include "CHdlProject.h"
#include "DesignTreeCorpus.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "ICompAdmin.h"
#include "IHdlElaborationData.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "IHdlProject.h"
#include "Identifiers.h"
#include "NetListWalk.h"
#include "Port/File.h"
#include "Port/MsgDispatcher.h"
#include "Port/MsgManDefault.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"

namespace {

constexpr std::uint64_t kCorpusSeed = 20240917;
// Figures come from optimised builds; the checked builds only smoke-run the program, on a tenth.
#ifdef NDEBUG
constexpr std::size_t kFileCount = 10000;
#else
constexpr std::size_t kFileCount = 1000;
#endif

// The generated files in a temporary directory of their own, removed at exit.
class CorpusOnDisk {
 public:
  explicit CorpusOnDisk(int backReferencePercent) {
    QuillonBench::DesignTreeCorpus::Options options;
    options.fileCount = kFileCount;
    options.libraryPackages = kFileCount * 3 / 20;
    options.backReferencePercent = backReferencePercent;
    Port::StringBase dir;
    if (!Port::File::mkdtemp(&dir)) return;
    dir_ = dir.str();
    for (const auto& file : QuillonBench::DesignTreeCorpus(kCorpusSeed, options).Generate()) {
      std::string path = dir_ + "/" + file.name;
      if (!Write(path, file.text)) {
        paths_.clear();
        return;
      }
      paths_.push_back(std::move(path));
    }
  }
  CorpusOnDisk(const CorpusOnDisk&) = delete;
  CorpusOnDisk& operator=(const CorpusOnDisk&) = delete;
  ~CorpusOnDisk() {
    if (!dir_.empty()) Port::File::remove_r(dir_.c_str());
  }

  const std::vector<std::string>& paths() const { return paths_; }

 private:
  static bool Write(const std::string& path, const std::string& text) {
    std::FILE* out = std::fopen(path.c_str(), "wb");
    if (!out) return false;
    bool written = std::fwrite(text.data(), 1, text.size(), out) == text.size();
    return std::fclose(out) == 0 && written;
  }

  std::string dir_;
  std::vector<std::string> paths_;
};

const CorpusOnDisk& Corpus(std::int64_t variant) {
  static const CorpusOnDisk acyclic(0);
  static const CorpusOnDisk withCycles(1);
  return variant == 0 ? acyclic : withCycles;
}

// A project of all the corpus files, set up the way a host does it.
Prjrep::AutoPtr<Vad::IHdlProject> NewProject(const std::vector<std::string>& paths) {
  auto project = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
  auto* fileSet = Prjrep::QueryAs<Vad::IHdlFileSet>(project.Get());
  if (!fileSet) return {};
  auto fileType = Host::FileType::Create("HDL", {"vhd"});
  for (const std::string& path : paths) {
    Prjrep::AutoPtr<Vad::IHdlFile> file;
    if (project->createNewFile(file.Out()) != CitI::kOk) return {};
    auto* admin = Prjrep::QueryAs<Vad::ICompAdmin>(file.Get());
    if (!admin || admin->InitializeAfterCreate(nullptr, fileType.Get()) != CitI::kOk) return {};
    file->setFilePath(Port::StringBase(path), Port::StringBase());
    file->setPluginName(Port::StringBase("PLUGIN_Vhdl"));
    fileSet->Add(file.Get());
  }
  return project;
}

std::size_t CountFiles(Vad::IHdlFileIterator* order) {
  std::size_t count = 0;
  for (; order && !order->IsDone(); order->Next()) ++count;
  return count;
}

std::size_t CountNodes(Vad::IHdlNetListNode* root) {
  std::size_t count = 0;
  Vad::NetListWalk::WalkPreOrder(root, [&](Vad::IHdlNetListNode*) {
    ++count;
    return Vad::NetListWalk::Step::kDescend;
  });
  return count;
}

void BM_GetCompileOrder(benchmark::State& state) {
  bench::QuietMessages quiet;
  const auto& corpus = Corpus(state.range(0));
  auto project =
      bench::RegisterComponentsOnce() ? NewProject(corpus.paths()) : Prjrep::AutoPtr<Vad::IHdlProject>();
  Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
  Prjrep::AutoPtr<Vad::IHdlParserConfig> config;
  Prjrep::AutoRelease<Vad::CElaborator> elaborator;
  auto* projectObject = Prjrep::ObjectCast<Vad::CHdlProject>(project.Get());
  if (corpus.paths().empty() || !projectObject ||
      Prjrep::QueryAs<Vad::IHdlElaborationData>(project.Get())->getHierarchyRoot(root.Out()) != CitI::kOk ||
      project->getParserConfig(config.Out()) != CitI::kOk ||
      projectObject->getElaborator(elaborator.Out()) != CitI::kOk) {
    state.SkipWithError("the corpus project could not be set up");
    return;
  }
  std::size_t files = 0;
  for (auto _ : state) {
    Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
    if (Vad::CCompileOrder::OrderBelow(*elaborator.Get(), projectObject->getLibraryReferences(), root.Get(),
                                       nullptr, config.Get(), true, order.Out()) != CitI::kOk) {
      state.SkipWithError("no compile order");
      break;
    }
    files = CountFiles(order.Get());
  }
  state.counters["files"] = static_cast<double>(files);
  state.counters["nodes"] = static_cast<double>(CountNodes(root.Get()));
}
BENCHMARK(BM_GetCompileOrder)->Arg(0)->Arg(1)->Unit(benchmark::kMillisecond);

void BM_FilesToCompileOrder(benchmark::State& state) {
  bench::QuietMessages quiet;
  const auto& corpus = Corpus(state.range(0));
  if (!bench::RegisterComponentsOnce() || corpus.paths().empty()) {
    state.SkipWithError("the corpus could not be written");
    return;
  }
  std::size_t files = 0;
  for (auto _ : state) {
    auto project = NewProject(corpus.paths());
    Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
    auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(project.Get());
    if (!elaboration || elaboration->getCompileOrder(nullptr, order.Out()) != CitI::kOk) {
      state.SkipWithError("no compile order");
      break;
    }
    files = CountFiles(order.Get());
    state.PauseTiming();
    order = nullptr;
    project = nullptr;
    state.ResumeTiming();
  }
  state.counters["files"] = static_cast<double>(files);
}
BENCHMARK(BM_FilesToCompileOrder)->Arg(0)->Arg(1)->Unit(benchmark::kMillisecond);

}  // namespace
