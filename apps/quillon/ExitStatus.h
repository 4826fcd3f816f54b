#pragma once

namespace quillon {

inline constexpr int kExitDone = 0;
// The operation failed or an error message was issued.
inline constexpr int kExitFailed = 1;
// Bad usage or unreadable input.
inline constexpr int kExitBadInput = 2;

}  // namespace quillon
