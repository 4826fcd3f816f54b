#include "EdifParserPlx.h"

#include <exception>
#include <set>
#include <vector>

#include "CParserConfigHolder.h"
#include "ConverterRun.h"
#include "NetlistDatabaseRead.h"
#include "Port/InitObjects.h"
#include "xdm/Xdm_Model.h"
#include "xdm/Xdm_View.h"

namespace Vad {
namespace {

constexpr ConverterMessages kEdifConverterMessages{"Unable to run edifconv - Process Failed\n",
                                                   "Unable to run edifconv - Bad Command Line\n"};

using NetlistDatabaseRead::HierarchicalChildren;
using NetlistDatabaseRead::PropertyText;

// Records the instances of the block's non-primitive typed children, each type and name pair
// once.
void RecordInstances(const Xdm_Block& block, CParserConfigHolder& holder) {
  std::set<std::string> seen;
  for (const Xdm_Block* child : HierarchicalChildren(block)) {
    const Xdm_Property* type = child->GetPropertyByName("TYPE");
    if (!type || !seen.insert(type->GetValue() + "|" + child->GetName()).second) continue;
    holder.AddCompInst(Port::StringBase(child->GetName()), Port::StringBase(type->GetValue()), 0,
                       NetlistTypeIds::Instance(), PropertyText(*child, "PARTITION"));
  }
}

}  // namespace

int EdifParserPlx::Parse(CParserConfigHolder& holder) {
  const SourceNames source(holder);
  const Port::StringBase databaseName = source.baseName + ".tbx";
  CurrentDirectoryScope inSourceDirectory(source.directory);
  visitedTypes_.clear();
  const int status = RunConverter(holder, {"edifconv", source.fileName.str()}, kEdifConverterMessages);
  if (!ConverterOutputUsable("edifconv", source.fileName, databaseName, status)) return 0;
  if (!Xdm_Model::CanOpen(databaseName.c_str())) {
    IssueConverterError(NoNetlistDatabaseText(databaseName.c_str()));
    return 0;
  }
  try {
    ReadDatabase(databaseName.c_str(), holder);
  } catch (const std::exception& failure) {
    IssueConverterError(Port::StringBase().Format("The tbx file: %s may be corrupt: %s\n",
                                                  databaseName.c_str(), failure.what()));
  }
  return 0;
}

void EdifParserPlx::ReadDatabase(const char* path, CParserConfigHolder& holder) {
  Xdm_Model model("SnxParser", "SnxParser", "1.1", false);
  model.Open(path, Xdm_Model::kOpenForReading);
  model.CreateTxn("txn", Xdm_Model::kTxnRead);
  Xdm_Design& design = NetlistDatabaseRead::FirstDesign(model);
  if (const Xdm_Property* part = design.GetPropertyByName("PART")) holder.SetPart(part->GetValue());
  const Xdm_View* source = design.GetViewByName("SOURCE");
  const Xdm_Block* top = source ? source->GetBlock() : nullptr;
  if (!top) throw Xdm_Exception::Base("the design has no SOURCE view with a block");
  WalkBlocks(*top, holder);
}

void EdifParserPlx::WalkBlocks(const Xdm_Block& top, CParserConfigHolder& holder) {
  std::vector<const Xdm_Block*> pending{&top};
  bool topPending = true;
  while (!pending.empty()) {
    const Xdm_Block* block = pending.back();
    pending.pop_back();
    const bool isTop = topPending && block->GetPropertyByName("TYPE");
    if (!RecordBlock(*block, isTop, holder)) continue;
    if (isTop) topPending = false;
    std::vector<const Xdm_Block*> children = HierarchicalChildren(*block);
    pending.insert(pending.end(), children.rbegin(), children.rend());
  }
}

bool EdifParserPlx::RecordBlock(const Xdm_Block& block, bool isTop, CParserConfigHolder& holder) {
  // A block without a type names no cell: it records nothing, but the blocks inside it still do.
  const Xdm_Property* type = block.GetPropertyByName("TYPE");
  if (!type) return true;
  if (!visitedTypes_.emplace(type->GetValue(), 1).second) return false;
  holder.AddModule(Port::StringBase(type->GetValue()), 0, true,
                   isTop ? NetlistTypeIds::TopModule() : NetlistTypeIds::LowerModule(),
                   PropertyText(block, "PARTITION"));
  RecordInstances(block, holder);
  return true;
}

}  // namespace Vad
