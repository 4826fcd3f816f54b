// The port query that the VHDL and the Verilog parser share: the port extractor reads the files
// that the parser lists and is asked for the requested unit by its own entity or module name.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "CitI.h"

namespace Vad {

class IHdlDesignUnit;
class IHdlFile;
class IHdlPortIterator;

namespace PortExtraction {

// Results besides 1 (ports handed out), 0 (files not available or the extractor failed) and
// kInvalidArg (null unit or out-parameter).
constexpr CitI::Result kUnitNotFound = 10;
constexpr CitI::Result kGenericsWithoutValues = 11;

struct DesignFile {
  std::string path;
  int language;  // PepExtractor::kVerilog or kVhdl
};

// Fills the files for the extractor, in the order it should read them; false when they are not
// available.
using FileLister = std::function<bool(std::vector<DesignFile>& files)>;

// Empties `*out`, runs the extractor over the listed files and stores the iterator over the
// unit's ports in `*out`. Every result but 1 and kInvalidArg comes with an error message that
// says why, since the callers of a port query see only whether ports came back.
CitI::Result Extract(IHdlDesignUnit* unit, const FileLister& listFiles, IHdlPortIterator** out);

// The path the extractor reads `file` from: its directory and file name joined by one "/";
// false without a path.
bool ExtractorPathOf(IHdlFile* file, std::string& path);

}  // namespace PortExtraction
}  // namespace Vad
