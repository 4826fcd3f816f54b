// What the harnesses share: the registry set up once as a host sets it up, fuzz input written to
// a file of its own, and a project file made and parsed the way a host does.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "CParserConfigHolder.h"
#include "IHdlFile.h"
#include "IHdlProject.h"
#include "Prjrep/AutoPtr.h"

namespace fuzz {

// Registers the host components and the module's factories; once per process.
void SetUpOnce();

// Writes the input to "<temporary directory>/input<extension>"; its path.
std::string WriteInput(const std::uint8_t* data, std::size_t size, std::string_view extension);

// A new project with one file of the plug-in at `path`.
struct OneFileProject {
  OneFileProject(const std::string& path, std::string_view plugin);
  Vad::CParserConfigHolder* holder() const;

  Prjrep::AutoPtr<Vad::IHdlProject> project;
  Prjrep::AutoPtr<Vad::IHdlFile> file;
};

// Parses the input as a source of the plug-in and asks for every design unit, the hierarchy and
// the compile order.
void ParseAsSource(const std::uint8_t* data, std::size_t size, std::string_view extension,
                   std::string_view plugin);

}  // namespace fuzz
