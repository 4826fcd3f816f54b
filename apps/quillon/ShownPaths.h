// The paths that the output shows: source paths as the user gave them (relative stays relative),
// or full paths throughout with --absolute. The module and quillon's own checks work with full
// paths; only the writers' copies change, and JSON keeps the full path beside the shown one.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "DesignModel.h"
#include "Diagnostic.h"
#include "ProjectSources.h"

namespace quillon {

class ShownPaths {
 public:
  ShownPaths() = default;
  ShownPaths(const ProjectSources& sources, bool absolute);

  // The path to show for the full path of a file; the full path itself when it is no source.
  std::string Of(const std::string& fullPath) const;

  void Apply(FileInfo& file) const;
  void Apply(std::vector<FileInfo>& files) const;
  void Apply(std::vector<OrderEntry>& order) const;
  void Apply(TreeInfo& tree) const;
  void Apply(std::vector<Diagnostic>& diagnostics) const;
  void Apply(std::vector<MessageInfo>& messages) const;

 private:
  std::map<std::string, std::string> given_;  // full path -> as given
};

}  // namespace quillon
