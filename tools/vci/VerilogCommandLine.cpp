#include "vci/VerilogCommandLine.h"

#include <unistd.h>

#include <cerrno>
#include <string_view>

#include "vci/VerilogChars.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogMessageText.h"

namespace Hx_Vci {

namespace {

constexpr std::string_view kDefineOption = "+define+";
constexpr std::string_view kIncdirOption = "+incdir+";

std::vector<std::string> SplitAtPlus(std::string_view list) {
  std::vector<std::string> items;
  while (!list.empty()) {
    const std::size_t plus = list.find('+');
    const std::string_view item = list.substr(0, plus);
    if (!item.empty()) {
      items.emplace_back(item);
    }
    if (plus == std::string_view::npos) {
      break;
    }
    list.remove_prefix(plus + 1);
  }
  return items;
}

}  // namespace

VerilogCommandLine::VerilogCommandLine(int argc, const char* const* argv) {
  files_.reserve(argc > 0 ? static_cast<std::size_t>(argc) : 0);
  for (int i = 1; argv != nullptr && i < argc; ++i) {
    if (argv[i] == nullptr || argv[i][0] == '\0') {
      continue;
    }
    const std::string_view argument = argv[i];
    if (argument.starts_with(kDefineOption)) {
      AddDefines(std::string(argument.substr(kDefineOption.size())));
    } else if (argument.starts_with(kIncdirOption)) {
      AddIncludeDirs(std::string(argument.substr(kIncdirOption.size())));
    } else if (argument.front() == '/') {
      files_.push_back(argument);
    } else if (argument.front() != '+') {
      files_.push_back(completedPaths_.emplace_back(Absolute(std::string(argument))));
    }
  }
}

void VerilogCommandLine::AddDefines(const std::string& list) {
  for (const std::string& item : SplitAtPlus(list)) {
    const std::size_t equals = item.find('=');
    const std::string name = item.substr(0, equals);
    if (VerilogChars::ScanIdentifier(name, 0) != name.size() || name.empty()) {
      messages_.push_back({VerilogSeverity::kWarning, "", 0,
                           VerilogMessageLog::Format(VerilogMessageText::kBadDefine,
                                                     VerilogMessageLog::Quote(item).c_str())});
      continue;
    }
    defines_.emplace_back(name, equals == std::string::npos ? std::string() : item.substr(equals + 1));
  }
}

void VerilogCommandLine::AddIncludeDirs(const std::string& list) {
  for (std::string& directory : SplitAtPlus(list)) {
    includeDirs_.push_back(Absolute(std::move(directory)));
  }
}

std::string VerilogCommandLine::Absolute(std::string path) {
  if (path.front() == '/') {
    return path;
  }
  if (!workingDirectoryKnown_) {
    workingDirectory_ = CurrentDirectory();
    workingDirectoryKnown_ = true;
  }
  if (workingDirectory_.empty()) {
    return path;
  }
  return workingDirectory_ + (workingDirectory_.back() == '/' ? "" : "/") + path;
}

std::string VerilogCommandLine::CurrentDirectory() {
  std::string buffer(4096, '\0');
  while (::getcwd(buffer.data(), buffer.size()) == nullptr) {
    if (errno != ERANGE || buffer.size() > (std::size_t{1} << 20)) {
      return std::string();
    }
    buffer.resize(buffer.size() * 2);
  }
  buffer.resize(std::char_traits<char>::length(buffer.c_str()));
  return buffer;
}

}  // namespace Hx_Vci
