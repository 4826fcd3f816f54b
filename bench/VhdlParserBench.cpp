// Speed of a whole VHDL parse: the file is read, scanned, run through the grammar and every unit
// found is recorded into the file's holder, as a project does for each of its VHDL files.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <string>

#include "BenchSupport.h"
#include "CHdlFile.h"
#include "CParserConfigHolder.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "ICompAdmin.h"
#include "IHdlFile.h"
#include "IHdlProject.h"
#include "Identifiers.h"
#include "Port/File.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "VhdlCorpus.h"

namespace {

constexpr std::uint64_t kCorpusSeed = 20240611;

// A VHDL file of the generated corpus inside a project, the way a host sets one up.
class CorpusProject {
 public:
  explicit CorpusProject(std::size_t corpusBytes) {
    if (!bench::RegisterComponentsOnce()) return;
    Port::StringBase dir;
    if (!Port::File::mkdtemp(&dir)) return;
    dir_ = dir.str();
    path_ = dir_ + "/corpus.vhd";
    if (!WriteCorpus(corpusBytes)) return;
    project_ = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
    if (!project_ || project_->createNewFile(file_.Out()) != CitI::kOk) return;
    auto fileType = Host::FileType::Create("HDL", {"vhd"});
    auto* admin = Prjrep::QueryAs<Vad::ICompAdmin>(file_.Get());
    if (!admin || admin->InitializeAfterCreate(nullptr, fileType.Get()) != CitI::kOk) return;
    if (file_->setFilePath(Port::StringBase(path_), Port::StringBase()) != CitI::kOk) return;
    file_->setPluginName(Port::StringBase("PLUGIN_Vhdl"));
    if (Prjrep::QueryAs<Vad::IHdlFileSet>(project_.Get())->Add(file_.Get()) != CitI::kOk) return;
    holder_ = Prjrep::ObjectCast<Vad::CHdlFile>(file_.Get())->GetHolder();
  }
  CorpusProject(const CorpusProject&) = delete;
  CorpusProject& operator=(const CorpusProject&) = delete;
  ~CorpusProject() {
    if (!dir_.empty()) Port::File::remove_r(dir_.c_str());
  }

  Vad::CParserConfigHolder* holder() const { return holder_; }
  std::size_t bytes() const { return bytes_; }

 private:
  bool WriteCorpus(std::size_t corpusBytes) {
    std::string text = QuillonBench::VhdlCorpus(kCorpusSeed).Generate(corpusBytes);
    std::FILE* out = std::fopen(path_.c_str(), "wb");
    if (!out) return false;
    bool written = std::fwrite(text.data(), 1, text.size(), out) == text.size();
    written = std::fclose(out) == 0 && written;
    bytes_ = written ? text.size() : 0;
    return written;
  }

  std::string dir_;
  std::string path_;
  std::size_t bytes_ = 0;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Prjrep::AutoPtr<Vad::IHdlFile> file_;
  Vad::CParserConfigHolder* holder_ = nullptr;
};

void BM_VhdlParseWholeFile(benchmark::State& state) {
  CorpusProject corpus(static_cast<std::size_t>(state.range(0)));
  if (!corpus.holder()) {
    state.SkipWithError("the corpus project could not be set up");
    return;
  }
  std::uint32_t units = 0;
  for (auto _ : state) {
    corpus.holder()->Parse(nullptr);
    units = corpus.holder()->GetUnitCount();
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations()) *
                          static_cast<std::int64_t>(corpus.bytes()));
  state.counters["units"] = units;
}
BENCHMARK(BM_VhdlParseWholeFile)->Arg(1 << 20)->Arg(8 << 20)->Unit(benchmark::kMillisecond);

}  // namespace
