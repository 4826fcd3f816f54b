// Shared pieces of the library-reference tests: environment and working-directory scopes and a
// loader that counts what it is asked to do.
#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "CLibLoader.h"
#include "CLibRefs.h"
#include "Host/PropertyInstance.h"
#include "Port/Env.h"
#include "Port/File.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "ScopedEnv.h"
#include "rudiva/RudIva.h"

namespace libref_test {

// CORVANE naming the repository's cell libraries, as the command-line host sets it.
class ScopedCellLibraries : public ScopedEnv {
 public:
  ScopedCellLibraries() : ScopedEnv("CORVANE", Port_Env::GetInstallRoot().c_str()) {}
};

class ScopedWorkingDirectory {
 public:
  explicit ScopedWorkingDirectory(const std::string& dir) {
    EXPECT_TRUE(Port::File::getcwd(&saved_));
    EXPECT_TRUE(Port::File::chdir(dir.c_str()));
  }
  ScopedWorkingDirectory(const ScopedWorkingDirectory&) = delete;
  ScopedWorkingDirectory& operator=(const ScopedWorkingDirectory&) = delete;
  ~ScopedWorkingDirectory() { Port::File::chdir(saved_.c_str()); }

 private:
  Port::StringBase saved_;
};

inline std::string CurrentDirectory() {
  Port::StringBase dir;
  EXPECT_TRUE(Port::File::getcwd(&dir));
  return dir.str();
}

// What a CountingLoader was asked to do, kept outside it because the references own the loader.
struct LoaderLog {
  int loads = 0;
  std::vector<std::string> families;
  // "<library> load" and "<library> family <name>" for every call, across all loaders sharing it.
  std::vector<std::string> calls;
};

// Counts its loads and families and declares one component, "<LIBRARY>_CELL", in "vcomponents".
class CountingLoader final : public Vad::CLibLoader {
 public:
  CountingLoader(const char* library, LoaderLog* log, bool loads = true)
      : CLibLoader(library, "chdp.ini", RudIva::kSynthesisLibraries), log_(log), loads_(loads) {}

  bool Load(Vad::CLibRefs* references) override {
    ++log_->loads;
    log_->calls.push_back(LibraryName().str() + " load");
    references->RemoveLibrary(LibraryName());
    if (loads_) references->AddLibraryUnit(LibraryName(), "vcomponents", CellName());
    return loads_;
  }
  void SetFamily(const Port::StringBase& family) override {
    log_->families.push_back(family.str());
    log_->calls.push_back(LibraryName().str() + " family " + family.str());
  }

  std::string CellName() const {
    Port::StringBase name = LibraryName();
    name.MakeUpper();
    return name.str() + "_CELL";
  }

 protected:
  Port::StringBase FamilyTestFile(const Port::StringBase&) const override { return {}; }
  Port::StringBase FamilyDirectory(const Port::StringBase&) const override { return {}; }
  Port::StringBase DefaultDirectory() const override { return {}; }
  Port::StringBase MappingTextFor(const Port::StringBase&) const override { return {}; }

 private:
  LoaderLog* log_;
  bool loads_;
};

inline bool IsCell(const Vad::CLibRefs& references, std::string_view library, std::string_view name) {
  return references.HasLibraryUnit(library, "vcomponents", "all", name, "VHDL");
}

}  // namespace libref_test
