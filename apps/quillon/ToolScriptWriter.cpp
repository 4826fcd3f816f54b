#include "ToolScriptWriter.h"

#include "ExportText.h"

namespace quillon {

namespace {

bool IsVhdl(const ExportSource& source) { return source.language == SourceLanguage::kVhdl; }

bool FitsCommandFile(const std::string& text, const char* what, bool plusSeparates, std::string& error) {
  if (text.find_first_of(plusSeparates ? " \t+" : " \t") == std::string::npos) return true;
  error = std::string("cannot write the ") + what + " '" + text +
          "' into an Icarus Verilog command file: it holds " +
          (plusSeparates ? "a blank or a '+'" : "a blank");
  return false;
}

}  // namespace

bool ToolScriptWriter::Ghdl(const ExportPlan& plan, std::ostream& out, std::string&) {
  out << "#!/bin/sh\n"
         "# Analyses the VHDL sources in compile order with GHDL. GHDL, GHDL_FLAGS and WORKDIR may be set\n"
         "# in the environment.\n"
         "set -e\n"
         "GHDL=\"${GHDL:-ghdl}\"\n"
         "GHDL_FLAGS=\"${GHDL_FLAGS:---std=08}\"\n"
         "WORKDIR=\"${WORKDIR:-.quillon-build/ghdl}\"\n"
         "mkdir -p \"$WORKDIR\"\n"
         "# ghdl_run MODE LIBRARY ARGUMENT...; GHDL_FLAGS is split into words on purpose.\n"
         "ghdl_run() {\n"
         "  mode=$1 library=$2\n"
         "  shift 2\n"
         "  \"$GHDL\" \"$mode\" $GHDL_FLAGS --workdir=\"$WORKDIR\" -P\"$WORKDIR\" --work=\"$library\" "
         "\"$@\"\n"
         "}\n";
  for (const ExportSource& source : plan.sources) {
    if (IsVhdl(source)) {
      out << "ghdl_run -a " << source.library << ' ' << ExportText::ShellWord(source.path) << '\n';
    } else {
      out << "# not VHDL, for another tool: " << source.path << '\n';
    }
  }
  if (plan.top && !plan.top->verilog) {
    const ExportTop& top = *plan.top;
    out << "ghdl_run -e " << top.library << ' ' << ExportText::ShellWord(top.name);
    if (!top.architecture.empty()) out << ' ' << ExportText::ShellWord(top.architecture);
    out << '\n';
  }
  return true;
}

bool ToolScriptWriter::Iverilog(const ExportPlan& plan, std::ostream& out, std::string& error) {
  out << "# Icarus Verilog command file: iverilog -g2012";
  if (plan.top && plan.top->verilog) out << " -s " << plan.top->name;
  out << " -c THIS_FILE\n";
  for (const std::string& directory : plan.includeDirs) {
    if (!FitsCommandFile(directory, "include directory", true, error)) return false;
    out << "+incdir+" << directory << '\n';
  }
  for (const std::string& define : plan.defines) {
    if (!FitsCommandFile(define, "macro", true, error)) return false;
    out << "+define+" << define << '\n';
  }
  for (const ExportSource& source : plan.sources) {
    if (IsVhdl(source)) {
      out << "# not Verilog, for another tool: " << source.path << '\n';
      continue;
    }
    if (!FitsCommandFile(source.path, "path", false, error)) return false;
    out << source.path << '\n';
  }
  return true;
}

}  // namespace quillon
