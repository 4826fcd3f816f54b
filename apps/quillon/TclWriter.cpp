#include "TclWriter.h"

#include <vector>

namespace quillon {

namespace {

const char* LanguageName(SourceLanguage language) {
  switch (language) {
    case SourceLanguage::kVhdl:
      return "vhdl";
    case SourceLanguage::kVerilog:
      return "verilog";
    case SourceLanguage::kSystemVerilog:
      return "systemverilog";
  }
  return "";
}

std::string List(const std::vector<std::string>& elements) {
  std::string list;
  for (const std::string& element : elements) {
    if (!list.empty()) list += ' ';
    list += TclWriter::ListElement(element);
  }
  return list;
}

}  // namespace

std::string TclWriter::ListElement(std::string_view text) {
  if (text.empty()) return "{}";
  std::string element;
  for (char c : text) {
    if (c == '\n') {
      element += "\\n";
      continue;
    }
    if (std::string_view(" \t;\"\\{}[]$").find(c) != std::string_view::npos) element += '\\';
    element += c;
  }
  return element;
}

void TclWriter::Write(const ExportPlan& plan, std::ostream& out) {
  out << "# The sources in compile order: {library path language}.\nset quillon_files {\n";
  for (const ExportSource& source : plan.sources)
    out << "  {" << List({source.library, source.path, LanguageName(source.language)}) << "}\n";
  out << "}\nset quillon_incdirs {" << List(plan.includeDirs) << "}\nset quillon_defines {"
      << List(plan.defines) << "}\nset quillon_top {";
  if (plan.top) {
    std::vector<std::string> top{plan.top->library, plan.top->name};
    if (!plan.top->architecture.empty()) top.push_back(plan.top->architecture);
    out << List(top);
  }
  out << "}\n";
}

}  // namespace quillon
