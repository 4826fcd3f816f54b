// What a project is made of before it is built: its properties and its source files.
#pragma once

#include <map>
#include <string>
#include <vector>

namespace quillon {

struct SourceFile {
  std::string path;       // absolute
  std::string givenPath;  // as the user gave it, normalised; relative stays relative
  std::string library;
  std::string plugin;
  bool pluginByExtension = false;  // no plug-in was given: `plugin` follows the extension
};

struct ProjectSources {
  std::map<std::string, std::string> properties;
  std::vector<SourceFile> files;  // in the order given
  // Libraries that the sources name but the project does not hold ("externalLibraries").
  std::vector<std::string> externalLibraries;
  std::vector<std::string> warnings;  // found while the sources were gathered
  // Where the modules that the sources instantiate but do not define are looked for (-y, -v,
  // +libext+); paths as given.
  struct LibrarySearch {
    std::vector<SourceFile> directories;
    std::vector<SourceFile> files;
    std::vector<std::string> extensions;
  } librarySearch;
  // What the gathering read besides the sources: project files and lists, and the directories it
  // listed; whether a pattern was matched.
  struct Consulted {
    std::vector<std::string> files;
    std::vector<std::string> directories;
    bool patterns = false;
  } consulted;
};

}  // namespace quillon
