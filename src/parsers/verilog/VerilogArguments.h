// The argument vector with which the Verilog parser runs the Verilog data compiler for one file:
// the project's Verilog files before it, the file itself and the options from the parser
// configuration and the environment.
#pragma once

#include <string>
#include <vector>

#include "Port/StringBase.h"

namespace Vad {

class CParserConfigHolder;
class SiblingPaths;

class VerilogArguments {
 public:
  static constexpr const char* kCommandName = "commandname";
  static constexpr const char* kDataParserOption = "+dora+dataparser+CR172701";
  static constexpr const char* kClientOption = "+qtx_client";
  static constexpr const char* kDefinePrefix = "+define+";
  static constexpr const char* kIncludePrefix = "+incdir+";

  static constexpr const char* kParseTargetProperty = "PROP_Parse_Target";
  static constexpr const char* kSynthesisTarget = "Synthesis";  // compared ignoring case
  static constexpr const char* kMacrosProperty = "PROP_synVerilogMacros";
  static constexpr const char* kIncludeDirsProperty = "PROP_synVeriIncludeDir_Global";
  // Set to any value, it keeps the file's own directory out of the include list.
  static constexpr const char* kNoLocalIncludeVariable = "CORVANE_DISABLE_LOCAL_FILE_INCLUDE";

  // Reads the holder's full path, sibling paths and properties. The vector points into the
  // holder's sibling paths, which must stay unchanged while it is used: a project's files are
  // thus neither copied nor compared for each of its files.
  explicit VerilogArguments(const CParserConfigHolder& holder);
  VerilogArguments(const VerilogArguments&) = delete;
  VerilogArguments& operator=(const VerilogArguments&) = delete;

  int Count() const { return static_cast<int>(argv_.size()); }
  const char* const* Vector() const { return argv_.data(); }
  std::vector<std::string> Texts() const { return {argv_.begin(), argv_.end()}; }

  // "+define+" and the list with every ';' and '|' turned into '+'.
  static Port::StringBase DefineOption(const Port::StringBase& macros);
  // The include list with the directory part of `ownPath` appended unless the environment says
  // otherwise; empty when the resulting list is.
  static Port::StringBase IncludeOption(const Port::StringBase& includeDirs, const Port::StringBase& ownPath);

 private:
  void AddFiles(const SiblingPaths& siblings);
  void AddOptions(const CParserConfigHolder& holder);

  Port::StringBase ownPath_;
  Port::StringBase defineOption_;
  Port::StringBase includeOption_;
  std::vector<const char*> argv_;
};

}  // namespace Vad
