// The list of project files that a project hands to every file it brings up to date.
#pragma once

#include <map>
#include <memory>
#include <vector>

#include "IHdlFile.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TListIter.h"
#include "SiblingPaths.h"

namespace Vad {

// Full paths of the files in `files` whose plug-in name equals `pluginName` ignoring case, in
// list order. Moves the iterator.
std::vector<Port::StringBase> CollectPathsOfPlugin(IHdlFileIterator* files,
                                                   const Port::StringBase& pluginName);

// A file iterator that also answers, once per plug-in name, the paths of its files of that
// plug-in. Every file of a project asks the same question of the same list, so the answer is
// computed once and shared instead of once per file.
class CProjectFileList final : public Prjrep::TListIter<IHdlFileIterator, Prjrep::AutoPtr<IHdlFile>> {
 public:
  static Prjrep::AutoRelease<IHdlFileIterator> New(const std::vector<IHdlFile*>& files);

  std::shared_ptr<const SiblingPaths> PathsOfPlugin(const Port::StringBase& pluginName);

 protected:
  IHdlFile* Convert(Prjrep::AutoPtr<IHdlFile>& entry) override { return entry.Get(); }

 private:
  using TListIter::TListIter;

  std::map<Port::StringBase, std::shared_ptr<const SiblingPaths>> pathsByPlugin_;
};

}  // namespace Vad
