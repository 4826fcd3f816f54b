// Builds the module's project the way any host does: through the registry and the interfaces,
// with the host library's components for file types, source libraries and file components.
#pragma once

#include <map>
#include <string>

#include "IFileType.h"
#include "IHdlProject.h"
#include "ISourceLibrary.h"
#include "Prjrep/AutoPtr.h"
#include "ProjectSources.h"

namespace quillon {

class ProjectBuilder {
 public:
  // Points CORVANE at the installation root, where the cell libraries lie (and QUILLON_DATA_DIR at
  // its data when quillon is installed), unless the environment names them already.
  static void SetInstallRootWhenUnset();

  // Creates the project with the properties and files of `sources`. The first file gets the largest
  // order key, so that files are compiled in the order given; every file gets the V3 flag. False
  // with a one-line reason in `error`.
  bool Build(const ProjectSources& sources, std::string& error);

  Vad::IHdlProject* project() const { return project_.Get(); }

 private:
  static void SetWhenUnset(const char* name, const std::string& value);
  bool SetProperties(const ProjectSources& sources, std::string& error);
  bool AddFile(const SourceFile& source, std::uint64_t orderKey, std::string& error);
  Vad::IFileType* FileTypeOf(const std::string& plugin);
  Vad::ISourceLibrary* LibraryNamed(const std::string& name);

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  std::map<std::string, Prjrep::AutoPtr<Vad::IFileType>> fileTypes_;
  std::map<std::string, Prjrep::AutoPtr<Vad::ISourceLibrary>> libraries_;
};

}  // namespace quillon
