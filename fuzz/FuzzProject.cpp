#include "FuzzProject.h"

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <system_error>

#include "CHdlFile.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "ICompAdmin.h"
#include "IHdlElaborationData.h"
#include "IHdlNetListNode.h"
#include "Identifiers.h"
#include "Port/MsgDispatcher.h"
#include "Port/MsgManDefault.h"
#include "Prjrep/Casts.h"

extern "C" void InstFactoryEntry();

namespace fuzz {

namespace {

// Messages of the readers would fill the fuzzer's output. The default manager is taken out of
// the dispatcher rather than disabled, since a parse's message capture enables it again.
void SilenceMessages() { Port_MsgDispatcher::removeMsgMan(Port_MsgDispatcher::getDefaultMsgMan()); }

std::string& MadeDirectory() {
  static std::string directory;
  return directory;
}

// libFuzzer ends a time-boxed run through exit(), so the directory goes with the process.
void RemoveMadeDirectory() {
  std::error_code ignored;
  std::filesystem::remove_all(MadeDirectory(), ignored);
}

std::string InputDirectory() {
  static const std::string directory = [] {
    char pattern[] = "/tmp/quillon-fuzz-XXXXXX";
    const char* made = ::mkdtemp(pattern);
    if (!made) std::abort();
    MadeDirectory() = made;
    std::atexit(RemoveMadeDirectory);
    return std::string(made);
  }();
  return directory;
}

}  // namespace

void SetUpOnce() {
  static const bool ready = [] {
    if (!Host::RegisterHostComponents()) std::abort();
    InstFactoryEntry();
    SilenceMessages();
    return true;
  }();
  (void)ready;
}

std::string WriteInput(const std::uint8_t* data, std::size_t size, std::string_view extension) {
  const std::string path = InputDirectory() + "/input" + std::string(extension);
  std::FILE* out = std::fopen(path.c_str(), "wb");
  if (!out) std::abort();
  if (size > 0 && std::fwrite(data, 1, size, out) != size) std::abort();
  std::fclose(out);
  return path;
}

OneFileProject::OneFileProject(const std::string& path, std::string_view plugin)
    : project(Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject())) {
  if (!project || project->createNewFile(file.Out()) != CitI::kOk || !file) std::abort();
  auto fileType = Host::FileType::Create("HDL", {"vhd", "v"});
  Prjrep::QueryAs<Vad::ICompAdmin>(file.Get())->InitializeAfterCreate(nullptr, fileType.Get());
  file->setFilePath(Port::StringBase(path), Port::StringBase());
  file->setPluginName(Port::StringBase(plugin));
  if (auto* v3 = Prjrep::QueryAs<Vad::IHdlFileV3>(file.Get())) v3->setV3Flag(true);
  Prjrep::QueryAs<Vad::IHdlFileSet>(project.Get())->Add(file.Get());
}

Vad::CParserConfigHolder* OneFileProject::holder() const {
  return Prjrep::ObjectCast<Vad::CHdlFile>(file.Get())->GetHolder();
}

void ParseAsSource(const std::uint8_t* data, std::size_t size, std::string_view extension,
                   std::string_view plugin) {
  SetUpOnce();
  OneFileProject one(WriteInput(data, size, extension), plugin);
  Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
  one.project->getAllDesignUnits(units.Out());
  auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(one.project.Get());
  if (!elaboration) return;
  Prjrep::AutoRelease<Vad::IHdlFileIterator> order;
  elaboration->getCompileOrder(nullptr, order.Out());
}

}  // namespace fuzz
