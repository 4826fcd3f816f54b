// The elaborator's compile-order operation; the graph work is CCompileOrder's, the reduced unit
// trees are CUnitTree's.
#include "CCompileOrder.h"
#include "CElaborator.h"
#include "CUnitTree.h"
#include "NetListWalk.h"
#include "Port/InitObjects.h"
#include "Prjrep/AutoPtr.h"

namespace Vad {

CitI::Result CElaborator::GetCompileOrder(IHdlProject* project, IHdlNetListNode* start, IHdlNetListNode* top,
                                          IHdlParserConfig* parserConfig, bool byUnit,
                                          IHdlFileIterator** out) {
  if (!start || !out) return CitI::kInvalidArg;
  CCompileOrder order;
  if (!top || NetListWalk::Identity(top) == NetListWalk::Identity(start)) {
    return order.ComputeCompileOrder(start, out);
  }
  if (!byUnit) return order.ComputeCompileOrder(top, out);
  Prjrep::AutoPtr<IHdlNetListNode> tree;
  CitI::Result status = CUnitTree(*this).BuildUnitTree(project, start, top, parserConfig, tree);
  if (status != CitI::kOk) return status;
  return order.ComputeCompileOrder(tree.Get(), out);
}

}  // namespace Vad
