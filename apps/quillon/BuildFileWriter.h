// The build-tool exports: a Makefile, a build.ninja and Make-style dependency lines. Every source
// gets a stamp file under the build directory that depends on the source and on the stamps of
// the sources it needs, so that touching one source recompiles exactly it and what depends on it.
#pragma once

#include <ostream>
#include <string>
#include <string_view>
#include <vector>

#include "ExportModel.h"

namespace quillon {

class BuildFileWriter {
 public:
  static constexpr std::string_view kBuildDir = ".quillon-build";

  // The variables VHDL_COMPILE (run with the source's library in $(LIB)), VERILOG_COMPILE,
  // VERILOG_FLAGS and BUILD_DIR choose the commands. False, with the reason, for a path that make
  // cannot name (blanks, ':', ';', '\', wildcard characters).
  static bool Make(const ExportPlan& plan, std::ostream& out, std::string& error);
  static bool Ninja(const ExportPlan& plan, std::ostream& out, std::string& error);
  // One "STAMP: SOURCE STAMP..." line a source, paths escaped as make reads them.
  static bool Depfile(const ExportPlan& plan, std::ostream& out, std::string& error);

  // The stamp file of every source, relative to the build directory: LIBRARY.FILENAME.stamp, with
  // "-2", "-3"... added to a later source of the same name, so that a stamp keeps its name when
  // sources are added before it.
  static std::vector<std::string> StampNames(const ExportPlan& plan);
};

}  // namespace quillon
