#include "PlxParser.h"

#include <exception>

#include "CParserConfigHolder.h"
#include "ConverterRun.h"
#include "NetlistDatabaseRead.h"
#include "Port/InitObjects.h"
#include "xdm/Xdm_Model.h"
#include "xdm/Xdm_View.h"

namespace Vad {

int PlxParser::Parse(CParserConfigHolder& holder) {
  Port::StringBase path;
  holder.GetFullPath(path);
  if (ReadDatabase(path.c_str(), holder)) return 1;
  Port::StringBase baseName;
  holder.GetBaseName(baseName);
  holder.AddModule(baseName, 0, true, GetTypeId(1), Port::StringBase());
  return 1;
}

bool PlxParser::ReadDatabase(const char* path, CParserConfigHolder& holder) const {
  if (!Xdm_Model::CanOpen(path)) {
    IssueConverterWarning(NoNetlistDatabaseText(path));
    return false;
  }
  try {
    Xdm_Model model("N", "A", "V", false);
    model.Open(path, Xdm_Model::kOpenForReading);
    model.CreateTxn("txn", Xdm_Model::kTxnRead);
    RecordTopBlock(model, holder);
    return true;
  } catch (const std::exception& failure) {
    IssueConverterWarning(
        Port::StringBase().Format("The plx database %s may be corrupt: %s\n", path, failure.what()));
    return false;
  }
}

void PlxParser::RecordTopBlock(Xdm_Model& model, CParserConfigHolder& holder) const {
  Xdm_Design& design = NetlistDatabaseRead::FirstDesign(model);
  if (const Xdm_Property* part = design.GetPropertyByName("PART")) holder.SetPart(part->GetValue());
  const Xdm_View* view = design.GetViewItr().Next();
  const Xdm_Block* block = view ? view->GetBlock() : nullptr;
  if (!block) throw Xdm_Exception::Base("the design has no view with a block");
  holder.AddModule(Port::StringBase(block->GetName()), 0, true, GetTypeId(1), Port::StringBase());
}

}  // namespace Vad
