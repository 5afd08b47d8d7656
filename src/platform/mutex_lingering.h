#pragma once
// Mutexes whose last handle was closed while a live thread of this process owned them. They
// cannot go yet: the owner's thread library keeps them on that thread's list of robust mutexes,
// which it walks and rewrites as the thread locks, unlocks and ends. They go once no live thread
// of the process owns them (the owner ended, so the kernel took them off its list).

#include <functional>

#include "mutex_state.h"

namespace win32::detail {

// Runs release now when no live thread of the process owns state, else once none does.
void ReleaseWhenUnowned(MutexState* state, std::function<void()> release);

// Releases the kept mutexes whose owners have ended. Called as handles close; cheap while none
// are kept.
void ReleaseUnownedMutexes();

}  // namespace win32::detail
