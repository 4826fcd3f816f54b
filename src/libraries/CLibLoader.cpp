#include "CLibLoader.h"

#include <memory>

#include "CLibRefs.h"
#include "MsgCapture.h"
#include "Port/Env.h"
#include "Port/File.h"
#include "Port/InitObjects.h"
#include "Port/Stream.h"
#include "rudiva/RudIva.h"

namespace Vad {
namespace {

constexpr const char* kComponentPackage = "vcomponents";
constexpr std::array<const char*, 2> kSynthesisVerilogLibraries = {"basecell_ver", "blockcell_ver"};

// Makes a new directory the working directory for its lifetime. The directory is created under a
// unique name in one step, so no other process can slip in between naming and creating it. On
// every way out the earlier working directory comes back and the directory is removed with
// everything in it.
class ScopedTemporaryWorkDir {
 public:
  ScopedTemporaryWorkDir() {
    // Without the current directory there is nothing to come back to: stay where we are.
    if (!Port::File::getcwd(&saved_) || !Port::File::mkdtemp(&temporary_)) {
      temporary_.Empty();
      return;
    }
    entered_ = Port::File::chdir(temporary_.c_str());
  }
  ScopedTemporaryWorkDir(const ScopedTemporaryWorkDir&) = delete;
  ScopedTemporaryWorkDir& operator=(const ScopedTemporaryWorkDir&) = delete;
  ~ScopedTemporaryWorkDir() {
    if (temporary_.IsEmpty()) return;
    Port::File::chdir(saved_.c_str());
    Port::File::remove_r(temporary_.c_str());
  }

  bool entered() const { return entered_; }

 private:
  Port::StringBase saved_;
  Port::StringBase temporary_;
  bool entered_ = false;
};

}  // namespace

CLibLoader::CLibLoader(const char* libraryName, const char* mappingFileName, int nodeFileMode)
    : libraryName_(libraryName), mappingFileName_(mappingFileName), nodeFileMode_(nodeFileMode) {}

bool CLibLoader::Load(CLibRefs* references) {
  if (!references) return false;
  references_ = references;
  references->RemoveLibrary(libraryName_);
  ScopedTemporaryWorkDir workDir;
  if (!workDir.entered()) return false;
  WriteMappingFile();
  // Declared after the directory so that the managers are back before the directory goes.
  MsgCapture capture;
  return ReadComponents(*references);
}

void CLibLoader::SetFamily(const Port::StringBase& family) {
  Port::StringBase directory;
  if (Port_Env::GetDataFileName(FamilyTestFile(family).c_str(), 1, nullptr))
    directory = FamilyDirectory(family);
  if (directory == libraryDirectory_) return;
  libraryDirectory_ = directory;
  if (references_) Load(references_);
}

Port::StringBase CLibLoader::EffectiveDirectory() const {
  return libraryDirectory_.IsEmpty() ? DefaultDirectory() : libraryDirectory_;
}

// A file that cannot be written is not reported: the library loader then finds no mapping and
// the library contributes nothing.
void CLibLoader::WriteMappingFile() const {
  std::unique_ptr<Port::Stream> file = Port::File::open(mappingFileName_, "w+");
  if (!file) return;
  file->write(MappingText().view());
  file->close();
}

bool CLibLoader::ReadComponents(CLibRefs& references) const {
  RudIva* loader = RudIva::getPLI();
  RudIva_Node* package =
      loader->loadLibUnit(libraryName_.c_str(), kComponentPackage, "", RudIva::kPackageObject, nodeFileMode_);
  if (!package) return false;
  for (RudIva_Node* member : loader->getMembers(package, RudIva::kDeclarationMembers)) {
    if (loader->getType(member) != RudIva::kComponentDeclaration) continue;
    references.AddLibraryUnit(libraryName_, kComponentPackage, Port::StringBase(loader->getName(member)));
  }
  return true;
}

void CLibLoader::AppendMapping(Port::StringBase& text, std::string_view library, std::string_view directory) {
  text.Append(library).Append('=').Append(directory).Append('\n');
}

void CLibLoader::AppendFurtherSynthesisLibraries(Port::StringBase& text) {
  AppendMappingsUnder(text, "$CORVANE/vhdl/syn/", kFamilyLibraries);
  AppendMappingsUnder(text, "$CORVANE/verilog/syn/", kSynthesisVerilogLibraries);
}

}  // namespace Vad
