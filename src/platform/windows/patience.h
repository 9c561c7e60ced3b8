// What others hold open for a moment: scanners for viruses, indexers, IDEs.
#pragma once

#include "platform/error.h"
#include "platform/windows/api.h"

namespace qrex::platform {

inline bool MayBeHeld(uint32_t code) {
  return code == ERROR_SHARING_VIOLATION || code == ERROR_LOCK_VIOLATION || code == ERROR_ACCESS_DENIED ||
         code == ERROR_USER_MAPPED_FILE;
}

// Tries again while somebody may hold the file, for about a second in all. What is refused for good takes that long.
template <typename Try>
Result Patiently(Try attempt) {
  constexpr DWORD kFirstPause = 5, kLongestPause = 640;  // milliseconds
  Result result = attempt();
  for (DWORD pause = kFirstPause; !result && MayBeHeld(result.Code()) && pause < kLongestPause; pause *= 2) {
    Sleep(pause);
    result = attempt();
  }
  return result;
}

}  // namespace qrex::platform
