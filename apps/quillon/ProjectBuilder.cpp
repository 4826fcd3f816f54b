#include "ProjectBuilder.h"

#include <optional>
#include <vector>

#include "HdlSets.h"
#include "Host/FileComponent.h"
#include "Host/FileType.h"
#include "Host/PropertyInstance.h"
#include "Host/SourceLibrary.h"
#include "ICompAdmin.h"
#include "IFileCompReference.h"
#include "ISourceLibraryMember.h"
#include "Identifiers.h"
#include "InstallLayout.h"
#include "PluginTable.h"
#include "Port/Env.h"

namespace quillon {

// An installed quillon brings its data along; the host library knows only the build tree's.
void ProjectBuilder::SetInstallRootWhenUnset() {
  std::optional<std::string> installed = InstallLayout::InstalledDataDir();
  std::string root = installed ? *installed : Port_Env::GetInstallRoot().str();
  SetWhenUnset("CORVANE", root);
  if (installed) SetWhenUnset("QUILLON_DATA_DIR", root + "/share");
}

void ProjectBuilder::SetWhenUnset(const char* name, const std::string& value) {
  const char* current = Port_Env::GetEnv(name);
  if (!current || !*current) Port_Env::SetEnv(name, value.c_str());
}

bool ProjectBuilder::Build(const ProjectSources& sources, std::string& error) {
  project_ = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
  if (!project_) {
    error = "the module does not create a project";
    return false;
  }
  if (!SetProperties(sources, error)) return false;
  std::uint64_t orderKey = sources.files.size();
  for (const SourceFile& source : sources.files) {
    if (!AddFile(source, orderKey--, error)) return false;
  }
  return true;
}

bool ProjectBuilder::SetProperties(const ProjectSources& sources, std::string& error) {
  Prjrep::AutoRelease<Vad::IHdlParserConfig> config;
  project_->getParserConfig(config.Out());
  auto* properties = Prjrep::QueryAs<Vad::IPropertyInstanceSet>(config.Get());
  if (!properties) {
    error = "the project offers no property set";
    return false;
  }
  for (const auto& [name, value] : sources.properties) {
    if (properties->Add(Host::PropertyInstance::Create(name, value).Get()) != CitI::kOk) {
      error = "the project refuses the property " + name;
      return false;
    }
  }
  return true;
}

bool ProjectBuilder::AddFile(const SourceFile& source, std::uint64_t orderKey, std::string& error) {
  Prjrep::AutoRelease<Vad::IHdlFile> file;
  if (project_->createNewFile(file.Out()) != CitI::kOk || !file) {
    error = "the module does not create a source file for " + source.path;
    return false;
  }
  auto* admin = Prjrep::QueryAs<Vad::ICompAdmin>(file.Get());
  if (!admin || admin->InitializeAfterCreate(nullptr, FileTypeOf(source.plugin)) != CitI::kOk) {
    error = "the module's source file does not take the file type of " + source.path;
    return false;
  }
  if (file->setFilePath(Port::StringBase(source.path), Port::StringBase()) != CitI::kOk) {
    error = "the module does not take the path " + source.path;
    return false;
  }
  file->setPluginName(Port::StringBase(source.plugin));
  file->setOrderKey(orderKey);
  if (auto* v3 = Prjrep::QueryAs<Vad::IHdlFileV3>(file.Get())) v3->setV3Flag(true);
  if (auto* member = Prjrep::QueryAs<Vad::ISourceLibraryMember>(file.Get())) {
    member->setSourceLibrary(LibraryNamed(source.library));
  }
  if (auto* reference = Prjrep::QueryAs<Vad::IFileCompReference>(file.Get())) {
    reference->setFileComponent(Host::FileComponent::Create(source.path).Get());
  }
  auto* files = Prjrep::QueryAs<Vad::IHdlFileSet>(project_.Get());
  if (!files || files->Add(file.Get()) != CitI::kOk) {
    error = "the project does not take the file " + source.path;
    return false;
  }
  return true;
}

Vad::IFileType* ProjectBuilder::FileTypeOf(const std::string& plugin) {
  Prjrep::AutoPtr<Vad::IFileType>& type = fileTypes_[plugin];
  if (!type) {
    type = Host::FileType::Create(PluginTable::FileTypeName(plugin));
    for (std::string_view extension : PluginTable::Extensions(plugin)) {
      type->AddExtension(Port::StringBase(extension));
    }
  }
  return type.Get();
}

Vad::ISourceLibrary* ProjectBuilder::LibraryNamed(const std::string& name) {
  Prjrep::AutoPtr<Vad::ISourceLibrary>& library = libraries_[name];
  if (!library) library = Host::SourceLibrary::Create(name);
  return library.Get();
}

}  // namespace quillon
