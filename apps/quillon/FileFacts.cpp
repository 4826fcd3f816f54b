#include "FileFacts.h"

#include "ISourceLibraryMember.h"
#include "Prjrep/AutoPtr.h"

namespace quillon {

std::string FileFacts::PathOf(Vad::IHdlFile* file) {
  Port::StringBase directory, name;
  if (!file || file->getFileName(&directory, &name) != CitI::kOk) return {};
  return directory.str() + name.str();
}

std::string FileFacts::LibraryOf(Vad::IHdlFile* file) {
  Prjrep::AutoRelease<Vad::ISourceLibrary> library;
  auto* member = Prjrep::QueryAs<Vad::ISourceLibraryMember>(file);
  Port::StringBase name;
  if (member && member->getSourceLibrary(library.Out()) == CitI::kOk && library) library->GetName(&name);
  return name.IsEmpty() ? "work" : name.str();
}

std::string FileFacts::PluginOf(Vad::IHdlFile* file) {
  Port::StringBase plugin;
  if (file) file->getPluginName(&plugin);
  return plugin.str();
}

OrderEntry FileFacts::Describe(Vad::IHdlFile* file) {
  return {PathOf(file), LibraryOf(file), PluginOf(file)};
}

}  // namespace quillon
