#pragma once

#include "platform/windows/system.h"

// Other programs (scanners, indexers, viewers) open a file that was just written and keep it for a
// moment. A call that meets one of them fails, although it would succeed a little later.

// Numbers of attempts, 20 ms apart: about 0.2 seconds, and half a second for the history file.
inline constexpr int kShortPatience = 10;
inline constexpr int kLongPatience = 25;

// Whether "access denied" can be such a moment too: it is for a rename over a file, and for the
// move of a folder that contains an open file. Elsewhere it means missing rights.
enum class AccessDenied { kIsFinal, kMayPass };

// Repeats a call that returns false because of a sharing or lock violation, up to that many
// attempts. Returns the last result, with its reason in GetLastError.
template <typename Call>
bool CallWithPatience(int attempts, AccessDenied denied, Call call) {
  for (int i = 1; !call(); ++i) {
    const DWORD error = ::GetLastError();
    const bool mayPass = error == ERROR_SHARING_VIOLATION || error == ERROR_LOCK_VIOLATION ||
                         (error == ERROR_ACCESS_DENIED && denied == AccessDenied::kMayPass);
    if (!mayPass || i == attempts) {
      return false;
    }
    ::Sleep(/*dwMilliseconds=*/20);
  }
  return true;
}
