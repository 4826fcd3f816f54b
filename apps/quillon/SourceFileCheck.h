// Findings about single source files: the syntax errors that the module's VHDL and Verilog readers
// report as host messages, and sources that no HDL reader takes.
#pragma once

#include <string>
#include <vector>

#include "Diagnostic.h"
#include "Port/MsgMan.h"
#include "ProjectSources.h"

namespace quillon {

class SourceFileCheck {
 public:
  // True for an error message of the VHDL parser or the Verilog compiler about a source file;
  // `check` shows these as syntax-error diagnostics rather than as messages.
  static bool IsSyntaxError(const Port_MsgRecord& record);

  // One syntax-error diagnostic for each such message, in the order they came, with the file
  // and line of the message and its text without the place in front.
  static std::vector<Diagnostic> SyntaxErrors(const std::vector<Port_MsgRecord>& received);

  // A not-hdl finding (an error when `strict`) for each source that got the general plug-in
  // because its extension names none: the general plug-in records nothing but the file's name.
  // A general plug-in that the user chose is left alone.
  static std::vector<Diagnostic> NotHdl(const std::vector<SourceFile>& files, bool strict);
};

}  // namespace quillon
