// The text of one file after preprocessing, ready for the lexer, with what is needed to give every
// position its file and line in the original sources.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "vci/VerilogFileStamp.h"

namespace Hx_Vci {

// From `offset` on (up to the next segment), the text continues line `line` of file `fileId`; every
// later line break advances the line. A segment other than the first always starts right after a
// line break, which then belongs to the segment before it.
struct VerilogLineSegment {
  std::size_t offset = 0;
  std::uint32_t fileId = 0;
  std::uint32_t line = 1;
};

// A file the result depends on besides the compiled file itself: an included file, or a place
// where an include was looked for and nothing was found (exists false).
struct VerilogDependency {
  std::string path;
  VerilogFileStamp stamp;
};

struct VerilogPreprocessedText {
  // No comments and no directives; macros are expanded and false conditional regions removed.
  // Line breaks of the source are kept, so lines need segments only where includes begin and end.
  std::string text;
  std::vector<VerilogLineSegment> segments;  // at least one, the first at offset 0
  std::vector<std::string> fileNames;        // by fileId; 0 is the compiled file
};

}  // namespace Hx_Vci
