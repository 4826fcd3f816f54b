#include "EdifParserEx.h"

#include <memory>
#include <vector>

#include "EdifPrimitiveCells.h"
#include "Port/Env.h"
#include "Port/File.h"
#include "Port/Stream.h"

namespace Vad {

namespace {

bool IsSet(const char* variable) { return Port_Env::GetEnv(variable) != nullptr; }

Port::StringBase Text(const std::string& text) { return Port::StringBase(text); }

const EdifNode* FindDesignNode(const EdifNode& root) {
  for (const EdifNode* child : root.children) {
    if (!child->designCellName.empty()) return child;
  }
  return nullptr;
}

}  // namespace

const Port::XUID& EdifParserEx::ModuleTypeId() {
  static const Port::XUID id{std::string_view("{45521D25-692C-4132-B1A3-3B13F6144A62}")};
  return id;
}

const Port::XUID& EdifParserEx::InstanceTypeId() {
  static const Port::XUID id{std::string_view("{B237B353-2643-4349-909D-962EC491A5A1}")};
  return id;
}

int EdifParserEx::Parse(CParserConfigHolder& holder) {
  Port::StringBase path;
  holder.GetFullPath(path);
  const bool always = IsSet(kAlwaysHierarchical);
  const bool never = IsSet(kNeverHierarchical);
  ResetTables();
  // Forced flat, a partition changes nothing: the scan goes on to the design.
  Summary summary = ReadEdif(path, !never);
  if (always || (!never && summary.hasPartition)) return ParseHierarchy(holder, path);
  RecordTopModules(holder, summary);
  return 1;
}

int EdifParserEx::ParseHierarchy(CParserConfigHolder& holder, const Port::StringBase& path) {
  std::unique_ptr<Port::Stream> input = Port::File::open(path.c_str(), "r");
  if (!input) {
    ReportError(kFileNotFound, path.c_str());
    return 0;
  }
  tree_.Clear();
  EdifParseContext context(*input, tree_);
  RunEdifGrammar(context);
  Port::File::close(input);
  renames_ = std::move(context.renames);
  RecordDesign(holder, path);
  return 1;
}

void EdifParserEx::RecordDesign(CParserConfigHolder& holder, const Port::StringBase& path) {
  const EdifNode* design = FindDesignNode(tree_.Root());
  if (!design) {
    Port::StringBase fileName;
    holder.GetFileName(fileName);
    ReportError(kNoDesign, (fileName.IsEmpty() ? path : fileName).c_str());
    return;
  }
  holder.SetPart(Text(design->part));
  // Depth first in document order, without recursion: the tree may be as deep as the file nests.
  std::vector<const EdifNode*> pending(tree_.Root().children.rbegin(), tree_.Root().children.rend());
  while (!pending.empty()) {
    const EdifNode* node = pending.back();
    pending.pop_back();
    if (!node->hasBody) continue;
    RecordModule(holder, *node, *design);
    RecordInstances(holder, *node);
    pending.insert(pending.end(), node->children.rbegin(), node->children.rend());
  }
}

void EdifParserEx::RecordModule(CParserConfigHolder& holder, const EdifNode& node, const EdifNode& design) {
  if (node.cellName == design.designCellName) {
    const std::string& partition = node.partition.empty() ? design.partition : node.partition;
    holder.AddModule(Text(node.cellName), 0, true, TopModuleTypeId(), Text(partition));
  } else {
    holder.AddModule(Text(node.cellName), 0, true, ModuleTypeId(), Text(node.partition));
  }
}

void EdifParserEx::RecordInstances(CParserConfigHolder& holder, const EdifNode& module) {
  for (const EdifNode* child : module.children) {
    if (child->instanceName.empty()) continue;
    auto renamed = renames_.find(child->cellName);
    const std::string& cell = renamed == renames_.end() ? child->cellName : renamed->second;
    if (EdifPrimitiveCells::Contains(cell)) continue;
    holder.AddCompInst(Text(child->instanceName), Text(cell), 0, InstanceTypeId(), Text(child->partition));
  }
}

}  // namespace Vad
