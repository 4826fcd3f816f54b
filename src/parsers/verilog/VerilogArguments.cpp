#include "VerilogArguments.h"

#include "CParserConfigHolder.h"
#include "Port/Env.h"
#include "Port/FileName.h"
#include "SiblingPaths.h"

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

void VerilogArguments::AddFiles(const SiblingPaths& siblings) {
  const auto texts = siblings.Texts().begin();
  const auto before = static_cast<std::ptrdiff_t>(siblings.CountBefore(ownPath_.view()));
  argv_.reserve(static_cast<std::size_t>(before) + 8);
  argv_.push_back(kCommandName);
  argv_.insert(argv_.end(), texts, texts + before);
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
