#include "VerilogArguments.h"

#include "CParserConfigHolder.h"
#include "Port/Env.h"
#include "Port/FileName.h"

namespace Vad {
namespace {

Port::StringBase ListAsOption(const char* prefix, Port::StringBase list) {
  list.ReplaceAll(";", "+");
  list.ReplaceAll("|", "+");
  Port::StringBase option(prefix);
  option.Append(list.view());
  return option;
}

// An absent property reads as empty text and still counts as readable; only a file without a
// configuration has none.
bool ReadProperty(const CParserConfigHolder& holder, const char* name, Port::StringBase& value) {
  return holder.GetProperty(name, value) == CitI::kOk;
}

}  // namespace

VerilogArguments::VerilogArguments(const CParserConfigHolder& holder) {
  holder.GetFullPath(ownPath_);
  AddFiles(holder.GetSiblingPaths());
  AddOptions(holder);
}

void VerilogArguments::AddFiles(const std::vector<Port::StringBase>& siblings) {
  argv_.reserve(siblings.size() + 7);
  argv_.push_back(kCommandName);
  // Runs once per sibling of every file of a project, so the inlined comparison of std::string.
  for (const Port::StringBase& sibling : siblings) {
    if (sibling.str() == ownPath_.str()) break;
    argv_.push_back(sibling.c_str());
  }
  argv_.push_back(ownPath_.c_str());
}

void VerilogArguments::AddOptions(const CParserConfigHolder& holder) {
  argv_.push_back(kDataParserOption);
  Port::StringBase value;
  if (ReadProperty(holder, kParseTargetProperty, value) &&
      value.Equals(kSynthesisTarget, Port::kCompareNoCase)) {
    argv_.push_back(kClientOption);
  }
  if (ReadProperty(holder, kMacrosProperty, value) && !value.IsEmpty()) {
    defineOption_ = DefineOption(value);
    argv_.push_back(defineOption_.c_str());
  }
  if (ReadProperty(holder, kIncludeDirsProperty, value)) {
    includeOption_ = IncludeOption(value, ownPath_);
    if (!includeOption_.IsEmpty()) argv_.push_back(includeOption_.c_str());
  }
}

Port::StringBase VerilogArguments::DefineOption(const Port::StringBase& macros) {
  return ListAsOption(kDefinePrefix, macros);
}

Port::StringBase VerilogArguments::IncludeOption(const Port::StringBase& includeDirs,
                                                 const Port::StringBase& ownPath) {
  Port::StringBase list = includeDirs;
  if (!Port_Env::GetEnv(kNoLocalIncludeVariable)) {
    if (!list.IsEmpty()) list.Append(';');
    // The path without base name and extension: the directory with its trailing '/'.
    list.Append(Port::FileName::GetHead(ownPath.view()).view());
  }
  if (list.IsEmpty()) return Port::StringBase();
  return ListAsOption(kIncludePrefix, list);
}

}  // namespace Vad
