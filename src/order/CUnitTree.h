// The reduced hierarchy tree for the compile order of one design unit: the unit's own tree,
// widened by the trees of the other units that share its source files, elaborated afresh.
#pragma once

#include <set>

#include "CitI.h"
#include "IHdlElement.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "IHdlParserConfig.h"
#include "Prjrep/AutoPtr.h"

namespace Vad {

class CElaborator;
class CLibRefs;

// Results: 1 success, kInvalidArg (0x1100000000000003) for a missing argument, else the failing
// step's result. Elements and files in the sets are borrowed from the trees and the project.
class CUnitTree {
 public:
  using ElementSet = std::set<IHdlElement*>;
  using FileSet = std::set<IHdlFile*>;

  explicit CUnitTree(CElaborator& elaborator) : elaborator_(elaborator) {}

  // `tree` receives `top` itself when no other unit shares its files; otherwise the root of an
  // elaboration (with `libraryReferences`) of the top tree's units plus the subtrees (found
  // below `start`) of every unit that shares a file with the tree, repeated until no such unit
  // is left out.
  CitI::Result BuildUnitTree(CLibRefs* libraryReferences, IHdlNetListNode* start, IHdlNetListNode* top,
                             IHdlParserConfig* parserConfig, Prjrep::AutoPtr<IHdlNetListNode>& tree);
  // Empties `out`, then adds the elements of the subtree below `start` of every design unit that
  // lies in a source file of `tree` but is not in `tree`.
  CitI::Result CollectExtraUnits(IHdlNetListNode* start, IHdlNetListNode* tree,
                                 IHdlParserConfig* parserConfig, ElementSet& out);
  // Adds the element of every node below (and at) `node` that has one.
  static void CollectTreeElements(IHdlNetListNode* node, ElementSet& out);
  // Adds the source file of every node's element below (and at) `node` that has one.
  static void CollectTreeFiles(IHdlNetListNode* node, FileSet& out);

 private:
  CElaborator& elaborator_;
};

}  // namespace Vad
