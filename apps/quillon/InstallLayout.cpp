#include "InstallLayout.h"

#include <cstdlib>
#include <filesystem>

namespace quillon {

namespace {

namespace fs = std::filesystem;

bool IsFile(const fs::path& path) {
  std::error_code error;
  return fs::is_regular_file(path, error);
}

}  // namespace

std::string InstallLayout::ProgramDir() {
  std::error_code error;
  fs::path program = fs::read_symlink("/proc/self/exe", error);
  return error ? std::string() : program.parent_path().string();
}

std::string InstallLayout::ModulePath() {
  const char* fromEnvironment = std::getenv("QUILLON_MODULE");
  if (fromEnvironment && *fromEnvironment) return fromEnvironment;
  fs::path dir = ProgramDir();
  fs::path installed = (dir / QUILLON_INSTALLED_MODULE).lexically_normal();
  fs::path built = (dir / QUILLON_BUILT_MODULE).lexically_normal();
  if (!IsFile(installed) && IsFile(built)) return built.string();
  return installed.string();
}

std::optional<std::string> InstallLayout::InstalledDataDir() {
  fs::path data = (fs::path(ProgramDir()) / QUILLON_INSTALLED_DATA).lexically_normal();
  std::error_code error;
  if (!fs::is_directory(data, error)) return std::nullopt;
  return data.string();
}

}  // namespace quillon
