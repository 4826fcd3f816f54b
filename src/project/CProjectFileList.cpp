#include "CProjectFileList.h"

#include "IFileNameHelper.h"
#include "Port/InitObjects.h"

namespace Vad {

std::vector<Port::StringBase> CollectPathsOfPlugin(IHdlFileIterator* files,
                                                   const Port::StringBase& pluginName) {
  std::vector<Port::StringBase> paths;
  if (!files) return paths;
  for (files->First(); !files->IsDone(); files->Next()) {
    IHdlFile* file = files->Current();
    Port::StringBase filePlugin;
    if (!file || file->getPluginName(&filePlugin) != CitI::kOk) continue;
    if (!filePlugin.Equals(pluginName.view(), Port::kCompareNoCase)) continue;
    Port::StringBase path;
    if (auto* names = Prjrep::QueryAs<Prjrep::IFileNameHelper>(file)) names->GetFullPath(&path);
    paths.push_back(std::move(path));
  }
  return paths;
}

Prjrep::AutoRelease<IHdlFileIterator> CProjectFileList::New(const std::vector<IHdlFile*>& files) {
  std::vector<Prjrep::AutoPtr<IHdlFile>> entries;
  entries.reserve(files.size());
  for (IHdlFile* file : files) entries.emplace_back(file);
  return Prjrep::AutoRelease<IHdlFileIterator>(new CProjectFileList(std::move(entries)));
}

std::shared_ptr<const SiblingPaths> CProjectFileList::PathsOfPlugin(const Port::StringBase& pluginName) {
  Port::StringBase key = pluginName;
  key.MakeLower();
  auto& paths = pathsByPlugin_[key];
  if (!paths) paths = SiblingPaths::Shared(CollectPathsOfPlugin(this, pluginName));
  return paths;
}

}  // namespace Vad
