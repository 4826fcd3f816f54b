// Small pieces shared by the host components' implementations.
#pragma once

#include <string_view>

#include "CitI.h"

namespace Host {

// Copies `value` into a caller's out-parameter; kInvalidArg when the out-parameter is null.
template <class Out, class Value>
CitI::Result CopyOut(const Value& value, Out* out) {
  if (!out) return CitI::kInvalidArg;
  *out = value;
  return CitI::kOk;
}

// Extensions are kept without their dot; callers may write ".v" or "v".
inline std::string_view ExtensionText(std::string_view extension) {
  return extension.starts_with('.') ? extension.substr(1) : extension;
}

}  // namespace Host
