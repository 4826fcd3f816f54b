#include "Port/Env.h"

#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <string_view>
#include <system_error>

#ifndef QUILLON_INSTALL_ROOT
#define QUILLON_INSTALL_ROOT "data"
#endif

namespace {

bool IsValidName(const char* name) { return name && *name && !std::strchr(name, '='); }

bool IsNameChar(char c) {
  return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') || c == '_';
}

// Length of the `$VAR` or `${VAR}` reference at the start of `text` and the variable's name; 0
// when `text` does not start with a well-formed reference.
std::size_t ReferenceAt(std::string_view text, std::string& name) {
  if (text.size() < 2 || text[0] != '$') return 0;
  if (text[1] == '{') {
    std::size_t close = text.find('}', 2);
    if (close == std::string_view::npos || close == 2) return 0;
    name.assign(text.substr(2, close - 2));
    return close + 1;
  }
  std::size_t end = 1;
  while (end < text.size() && IsNameChar(text[end])) ++end;
  if (end == 1) return 0;
  name.assign(text.substr(1, end - 1));
  return end;
}

std::string ExpandVariables(std::string_view text) {
  std::string expanded;
  std::string name;
  for (std::size_t i = 0; i < text.size();) {
    std::size_t referenceLength = ReferenceAt(text.substr(i), name);
    const char* value = referenceLength ? Port_Env::GetEnv(name.c_str()) : nullptr;
    if (value) {
      expanded.append(value);
      i += referenceLength;
    } else {
      expanded.push_back(text[i]);
      ++i;
    }
  }
  return expanded;
}

bool IsExistingFile(const std::filesystem::path& path) {
  std::error_code error;
  return std::filesystem::is_regular_file(path, error);
}

}  // namespace

const char* Port_Env::GetEnv(const char* name) {
  if (!name || !*name) return nullptr;
  return std::getenv(name);
}

bool Port_Env::SetEnv(const char* name, const char* value) {
  if (!IsValidName(name) || !value) return false;
  return setenv(name, value, 1) == 0;
}

bool Port_Env::UnsetEnv(const char* name) {
  if (!IsValidName(name)) return false;
  return unsetenv(name) == 0;
}

Port::StringBase Port_Env::GetDataDir() {
  const char* configured = GetEnv("QUILLON_DATA_DIR");
  if (configured && *configured) return Port::StringBase(configured);
  return GetInstallRoot() + "/share";
}

Port::StringBase Port_Env::GetInstallRoot() { return Port::StringBase(QUILLON_INSTALL_ROOT); }

bool Port_Env::GetDataFileName(const char* name, int flag, Port::StringBase* fullPath) {
  if (fullPath) fullPath->Empty();
  if (!name || !*name) return false;
  std::filesystem::path path(ExpandVariables(name));
  if (path.is_relative()) path = std::filesystem::path(GetDataDir().str()) / path;
  path = path.lexically_normal();
  if (fullPath) *fullPath = path.string();
  return flag == 0 || IsExistingFile(path);
}

const char* Port_Env::GetPlatformPath() { return sizeof(void*) == 8 ? "lin64" : "lin"; }
