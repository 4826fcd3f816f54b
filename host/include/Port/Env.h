// The process environment and the host's data folder.
#pragma once

#include "Port/StringBase.h"

class Port_Env {
 public:
  // The variable's value, or null when it is unset (or the name is null or empty). The pointer is
  // valid until the variable is next changed.
  static const char* GetEnv(const char* name);

  // Sets a variable, replacing any value. False for a null value or a name that is null, empty or
  // holds '='. Not safe while another thread reads the environment.
  static bool SetEnv(const char* name, const char* value);
  // Removes a variable; true also when it was not set. False for a bad name as above.
  static bool UnsetEnv(const char* name);

  // Composes the full path of data file `name` into `fullPath` (which may be null). `$VAR` and
  // `${VAR}` references in the name are expanded from the environment (an unset variable stays as
  // written); the expanded name, if relative, is taken from the data folder: the folder named by
  // the environment variable QUILLON_DATA_DIR, else the one the host was built with. With `flag` 0
  // the answer is true once a path is composed; with any other flag it is true only when a file
  // exists at that path. A null or empty name gives false and an empty path.
  static bool GetDataFileName(const char* name, int flag, Port::StringBase* fullPath);

  // The data folder that GetDataFileName uses: QUILLON_DATA_DIR when set, else the "share" folder
  // of the installation root. Cell libraries lie beside it, so names such as
  // "../<family>/vhdl/syn/..." reach them.
  static Port::StringBase GetDataDir();

  // The installation root holding the cell libraries (what CORVANE names): the built-in data
  // folder of this build.
  static Port::StringBase GetInstallRoot();

  // The platform's directory name: "lin64" on 64-bit Linux, "lin" on 32-bit Linux.
  static const char* GetPlatformPath();
};
