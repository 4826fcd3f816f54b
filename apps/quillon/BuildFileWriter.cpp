#include "BuildFileWriter.h"

#include <map>

#include "ExportText.h"

namespace quillon {

namespace {

constexpr const char* kVhdlCompile =
    "ghdl -a --std=08 --workdir=$(BUILD_DIR)/ghdl -P$(BUILD_DIR)/ghdl --work=$(LIB)";
constexpr const char* kVerilogCompile = "iverilog -g2012 -t null -i";

bool IsVhdl(const ExportSource& source) { return source.language == SourceLanguage::kVhdl; }

// The -I and -D arguments of a Verilog compile, as shell words.
std::string VerilogFlags(const ExportPlan& plan) {
  std::string flags;
  for (const std::string& directory : plan.includeDirs)
    flags += ' ' + ExportText::ShellWord("-I" + directory);
  for (const std::string& define : plan.defines) flags += ' ' + ExportText::ShellWord("-D" + define);
  return flags;
}

// A path as a target or prerequisite of make: '$' and '#' escaped; what make would split or glob
// refused.
bool MakePath(const std::string& path, std::string& written, std::string& error) {
  if (path.find_first_of(" \t:;\\*?[]") != std::string::npos) {
    error = "cannot write " + path +
            " into a Makefile: make cannot name a path that holds blanks or any of : ; \\ * ? [ ]";
    return false;
  }
  written.clear();
  for (char c : path) {
    if (c == '#') written += '\\';
    written += c == '$' ? std::string("$$") : std::string(1, c);
  }
  return true;
}

// Ninja has no escape for '|' in a path.
bool NinjaPath(const std::string& path, std::string& written, std::string& error) {
  if (path.find('|') != std::string::npos) {
    error = "cannot write " + path + " into a ninja file: ninja cannot name a path that holds '|'";
    return false;
  }
  written.clear();
  for (char c : path) {
    if (c == '$' || c == ' ' || c == ':') written += '$';
    written += c;
  }
  return true;
}

bool EndsDepfileName(char c) { return c == ' ' || c == '\t' || c == '#' || c == ':'; }

// Depfiles are read by make and ninja alike: blanks, '#' and ':' take a backslash, '$' is doubled,
// and backslashes before any of those (or at the end, before the separating blank) are doubled so
// that they stay backslashes. A line break cannot be written.
bool DepfilePath(const std::string& path, std::string& written, std::string& error) {
  if (path.find_first_of("\n\r") != std::string::npos) {
    error = "cannot write " + path + " into a depfile: a path cannot hold a line break there";
    return false;
  }
  written.clear();
  std::size_t backslashes = 0;
  for (std::size_t at = 0; at <= path.size(); ++at) {
    if (at < path.size() && path[at] == '\\') {
      ++backslashes;
      continue;
    }
    const bool escaped = at == path.size() || EndsDepfileName(path[at]);
    written.append(escaped ? 2 * backslashes : backslashes, '\\');
    backslashes = 0;
    if (at == path.size()) break;
    if (EndsDepfileName(path[at])) written += '\\';
    written += path[at] == '$' ? std::string("$$") : std::string(1, path[at]);
  }
  return true;
}

}  // namespace

std::vector<std::string> BuildFileWriter::StampNames(const ExportPlan& plan) {
  std::vector<std::string> names;
  std::map<std::string, std::size_t> uses;
  for (const ExportSource& source : plan.sources) {
    std::string name = source.library + '.' + ExportText::SafeBaseName(source.path);
    std::size_t earlier = uses[name]++;
    names.push_back(name + (earlier == 0 ? "" : '-' + std::to_string(earlier + 1)) + ".stamp");
  }
  return names;
}

bool BuildFileWriter::Make(const ExportPlan& plan, std::ostream& out, std::string& error) {
  const std::vector<std::string> stamps = StampNames(plan);
  out << "# Compiles the sources in dependency order: make -f THIS_FILE [VAR=VALUE...].\n"
         "# Every source has a stamp file under BUILD_DIR; VHDL_COMPILE runs with the source's library\n"
         "# in $(LIB), and both compile commands get the source appended.\n"
      << "BUILD_DIR ?= " << kBuildDir << "\nVHDL_COMPILE ?= " << kVhdlCompile
      << "\nVERILOG_FLAGS ?=" << ExportText::DollarsDoubled(VerilogFlags(plan))
      << "\nVERILOG_COMPILE ?= " << kVerilogCompile << " $(VERILOG_FLAGS)\n\n.PHONY: all clean\nall:";
  for (std::size_t index = 0; index < plan.sources.size(); ++index)
    out << " \\\n  $(BUILD_DIR)/" << stamps[index];
  out << "\n\nclean:\n\trm -rf $(BUILD_DIR)\n";
  for (std::size_t index = 0; index < plan.sources.size(); ++index) {
    const ExportSource& source = plan.sources[index];
    std::string path;
    if (!MakePath(source.path, path, error)) return false;
    std::string stamp = "$(BUILD_DIR)/" + stamps[index];
    out << '\n' << stamp << ": LIB = " << source.library << '\n' << stamp << ": " << path;
    for (std::size_t need : source.needs) out << " $(BUILD_DIR)/" << stamps[need];
    out << "\n\t@mkdir -p $(BUILD_DIR)/ghdl\n\t"
        << (IsVhdl(source) ? "$(VHDL_COMPILE) " : "$(VERILOG_COMPILE) ")
        << ExportText::DollarsDoubled(ExportText::ShellWord(source.path)) << "\n\t@touch $@\n";
  }
  return true;
}

bool BuildFileWriter::Ninja(const ExportPlan& plan, std::ostream& out, std::string& error) {
  const std::vector<std::string> stamps = StampNames(plan);
  out << "# Compiles the sources in dependency order: ninja -f THIS_FILE. Every source has a stamp\n"
         "# file under build_dir; change the compile commands below to use other tools.\n"
      << "build_dir = " << kBuildDir
      << "\nvhdl_compile = ghdl -a --std=08 --workdir=$build_dir/ghdl -P$build_dir/ghdl"
      << "\nverilog_compile = " << kVerilogCompile << ExportText::DollarsDoubled(VerilogFlags(plan))
      << "\n\nrule vhdl\n  command = mkdir -p $build_dir/ghdl && $vhdl_compile --work=$lib $in && touch $out"
         "\n  description = VHDL $lib $in\n\nrule verilog\n  command = $verilog_compile $in && touch $out"
         "\n  description = Verilog $in\n";
  for (std::size_t index = 0; index < plan.sources.size(); ++index) {
    const ExportSource& source = plan.sources[index];
    std::string path;
    if (!NinjaPath(source.path, path, error)) return false;
    out << "\nbuild $build_dir/" << stamps[index] << ": " << (IsVhdl(source) ? "vhdl " : "verilog ") << path;
    if (!source.needs.empty()) out << " |";
    for (std::size_t need : source.needs) out << " $build_dir/" << stamps[need];
    out << "\n  lib = " << source.library << '\n';
  }
  return true;
}

bool BuildFileWriter::Depfile(const ExportPlan& plan, std::ostream& out, std::string& error) {
  std::vector<std::string> stamps = StampNames(plan);
  for (std::string& stamp : stamps) {
    if (!DepfilePath(std::string(kBuildDir) + '/' + stamp, stamp, error)) return false;
  }
  std::string text;
  for (std::size_t index = 0; index < plan.sources.size(); ++index) {
    std::string path;
    if (!DepfilePath(plan.sources[index].path, path, error)) return false;
    text += stamps[index] + ": " + path;
    for (std::size_t need : plan.sources[index].needs) text += ' ' + stamps[need];
    text += '\n';
  }
  out << text;
  return true;
}

}  // namespace quillon
