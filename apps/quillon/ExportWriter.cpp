#include "ExportWriter.h"

#include "BuildFileWriter.h"
#include "EdamWriter.h"
#include "TclWriter.h"
#include "ToolScriptWriter.h"

namespace quillon {

bool ExportWriter::Write(std::string_view format, const ExportPlan& plan, std::ostream& out,
                         std::string& error) {
  if (format == "make") return BuildFileWriter::Make(plan, out, error);
  if (format == "ninja") return BuildFileWriter::Ninja(plan, out, error);
  if (format == "depfile") return BuildFileWriter::Depfile(plan, out, error);
  if (format == "ghdl") return ToolScriptWriter::Ghdl(plan, out, error);
  if (format == "iverilog") return ToolScriptWriter::Iverilog(plan, out, error);
  if (format == "edam") {
    EdamWriter::Write(plan, out);
    return true;
  }
  if (format == "tcl") {
    TclWriter::Write(plan, out);
    return true;
  }
  error = "unknown export format '" + std::string(format) + "'";
  return false;
}

}  // namespace quillon
