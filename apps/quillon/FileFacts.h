// What quillon shows of a source file: its full path, library and plug-in, as the file reports
// them.
#pragma once

#include "DesignModel.h"
#include "IHdlFile.h"

namespace quillon {

class FileFacts {
 public:
  // The directory and file name that the file reports, joined; empty when it cannot say.
  static std::string PathOf(Vad::IHdlFile* file);
  // The name of the file's source library; "work" when it has none.
  static std::string LibraryOf(Vad::IHdlFile* file);
  static std::string PluginOf(Vad::IHdlFile* file);
  static OrderEntry Describe(Vad::IHdlFile* file);
};

}  // namespace quillon
