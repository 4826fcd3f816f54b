#include "ShownPaths.h"

namespace quillon {

ShownPaths::ShownPaths(const ProjectSources& sources, bool absolute) {
  if (absolute) return;
  for (const SourceFile& file : sources.files) given_.emplace(file.path, file.givenPath);
}

std::string ShownPaths::Of(const std::string& fullPath) const {
  auto given = given_.find(fullPath);
  return given == given_.end() ? fullPath : given->second;
}

void ShownPaths::Apply(FileInfo& file) const {
  file.fullPath = file.path;
  file.path = Of(file.fullPath);
}

void ShownPaths::Apply(std::vector<FileInfo>& files) const {
  for (FileInfo& file : files) Apply(file);
}

void ShownPaths::Apply(std::vector<OrderEntry>& order) const {
  for (OrderEntry& entry : order) {
    entry.fullPath = entry.path;
    entry.path = Of(entry.fullPath);
  }
}

void ShownPaths::Apply(TreeInfo& tree) const {
  for (TreeNodeInfo& node : tree.nodes) {
    if (!node.file) continue;
    node.fileFullPath = node.file;
    node.file = Of(*node.fileFullPath);
  }
}

void ShownPaths::Apply(std::vector<Diagnostic>& diagnostics) const {
  for (Diagnostic& diagnostic : diagnostics) {
    diagnostic.fileFullPath = diagnostic.file;
    diagnostic.file = Of(diagnostic.fileFullPath);
  }
}

void ShownPaths::Apply(std::vector<MessageInfo>& messages) const {
  for (MessageInfo& message : messages) {
    message.sourceFullPath = message.source;
    message.source = Of(message.sourceFullPath);
  }
}

}  // namespace quillon
