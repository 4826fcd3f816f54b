// Turns the source arguments and property options of the command line into a project
// description: reads project files and -f lists, checks that every source is a readable file,
// and gives every source its library and plug-in.
#pragma once

#include <set>
#include <string>
#include <string_view>

#include "FileList.h"
#include "Options.h"
#include "ProjectSources.h"

namespace quillon {

class ProjectLoader {
 public:
  static constexpr std::string_view kMacrosProperty = "PROP_synVerilogMacros";
  static constexpr std::string_view kIncludeDirsProperty = "PROP_synVeriIncludeDir_Global";
  static constexpr std::string_view kTargetProperty = "PROP_Parse_Target";
  static constexpr std::string_view kFamilyProperty = "PROP_DevFamilyPMName";

  explicit ProjectLoader(ProjectSources& sources);

  // False with a one-line reason in `error` that names the file at fault.
  bool Load(const Options& options, std::string& error);

  // The parts of Load, in the order Load uses them. Relative paths in a project file are taken
  // from the project file's directory; those of a -F list from the list's; those of a -f list and
  // of the command line from the current directory.
  bool AddArgument(const SourceArgument& argument, std::string& error);
  bool AddProjectFile(const SourceArgument& argument, std::string& error);
  bool AddFileList(const SourceArgument& argument, std::string& error);
  // A file, a directory (its HDL files, sorted) or a glob pattern (its matches, sorted).
  bool AddGiven(const std::string& given, const std::string& library, const std::string& plugin,
                std::string& error);
  bool AddSource(const std::string& given, std::string library, std::string plugin, std::string& error);
  void AddDefine(std::string_view define);
  void AddIncludeDir(std::string directory);

 private:
  void AppendToListProperty(std::string_view property, std::string_view value);
  bool TakeListContents(FileList::Contents contents, std::string& error);
  bool AddPathOrDirectory(const std::string& given, const std::string& library, const std::string& plugin,
                          std::string& error);

  ProjectSources& sources_;
  FileList lists_;
  std::set<std::string> seen_;  // full paths of the sources taken
};

}  // namespace quillon
