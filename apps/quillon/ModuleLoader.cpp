#include "ModuleLoader.h"

#include <dlfcn.h>

#include "InstallLayout.h"

namespace quillon {

ModuleLoader::~ModuleLoader() {
  // The module stays loaded until the process ends: objects it made may outlive this loader.
}

bool ModuleLoader::Load(std::string& error) {
  path_ = InstallLayout::ModulePath();
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
