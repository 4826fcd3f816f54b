#include "ModuleLoader.h"

#include <dlfcn.h>

#include <cstdlib>

#include "InstallLayout.h"

namespace quillon {

ModuleLoader::~ModuleLoader() {
  // The module stays loaded until the process ends: objects it made may outlive this loader.
}

bool ModuleLoader::Load(std::string& error) { return Open(InstallLayout::ModulePath(), error); }

bool ModuleLoader::LoadInstead(const std::string& defaultPath, std::string& error) {
  const char* fromEnvironment = std::getenv("QUILLON_MODULE");
  return Open(fromEnvironment && *fromEnvironment ? fromEnvironment : defaultPath, error);
}

bool ModuleLoader::Open(const std::string& path, std::string& error) {
  path_ = path;
  handle_ = dlopen(path_.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (!handle_) {
    const char* reason = dlerror();
    error = "cannot load the module " + path_ + ": " + (reason ? reason : "unknown reason");
    return false;
  }
  auto entry = reinterpret_cast<void (*)()>(dlsym(handle_, "InstFactoryEntry"));
  if (!entry) {
    error = "the module " + path_ + " has no InstFactoryEntry";
    return false;
  }
  entry();
  return true;
}

}  // namespace quillon
