// Reads library modules the way simulators do: a module of a -y directory or a -v file joins the
// sources when a source instantiates it and no source defines it, and so on for what it needs in
// turn, until nothing new is needed.
#pragma once

#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "DesignModel.h"
#include "ProjectSources.h"

namespace quillon {

class LibraryResolver {
 public:
  explicit LibraryResolver(ProjectSources& sources) : sources_(sources) {}

  // Appends the needed library files to the sources. The module must be loaded; its messages
  // about the files looked at belong to the run proper, so the caller keeps them out of sight.
  // False with a one-line reason in `error`.
  bool Resolve(std::string& error);

 private:
  // The units of `files`, read by the module in a project of their own.
  bool Scan(const std::vector<SourceFile>& files, std::vector<FileInfo>& found, std::string& error) const;
  bool OfferLibraryFileModules(std::string& error);
  // The file that defines module `name`: a -v file first, then NAME+extension in a -y directory.
  std::optional<SourceFile> Find(const std::string& name) const;
  void Define(const std::vector<FileInfo>& files);

  ProjectSources& sources_;
  std::map<std::string, SourceFile> offered_;                      // module name -> the -v file defining it
  std::map<std::string, std::vector<std::string>> modulesOfFile_;  // -v file's full path -> its modules
  std::set<std::string> defined_;
};

}  // namespace quillon
