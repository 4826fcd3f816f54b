// Loads the Quillon module the way any host does.
#pragma once

#include <string>

namespace quillon {

class ModuleLoader {
 public:
  ModuleLoader() = default;
  ~ModuleLoader();
  ModuleLoader(const ModuleLoader&) = delete;
  ModuleLoader& operator=(const ModuleLoader&) = delete;

  // Opens the module that InstallLayout::ModulePath names and calls its InstFactoryEntry. False with a
  // one-line reason in `error`.
  bool Load(std::string& error);
  // The same with another module than the one built with this program, for hosts installed
  // elsewhere; QUILLON_MODULE still comes first.
  bool LoadInstead(const std::string& defaultPath, std::string& error);
  const std::string& path() const { return path_; }

 private:
  bool Open(const std::string& path, std::string& error);

  void* handle_ = nullptr;
  std::string path_;
};

}  // namespace quillon
