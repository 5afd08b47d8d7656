#pragma once
// Mutex handles: the kernel objects behind the HANDLEs of CreateMutexW and OpenMutexW, closed by
// CloseHandle like files, and the look-up that waits and releases use.

#include <memory>

#include "handle_table.h"
#include "mutex_named_table.h"
#include "mutex_state.h"

namespace win32::detail {

class MutexHandle final : public KernelObject {
 public:
  // A handle to the named mutex, whose handle count it already holds.
  explicit MutexHandle(NamedMutex* named) : state_(StateOf(*named)), named_(named) {}
  // A handle to a new unnamed mutex, which it owns.
  explicit MutexHandle(std::unique_ptr<MutexState> unnamed) : state_(unnamed.release()), named_(nullptr) {}
  ~MutexHandle() override;

  MutexState* state() const { return state_; }

 private:
  MutexState* state_;
  NamedMutex* named_;
};

// Registers the handle and remembers it for the calling thread's next look-up.
HANDLE RegisterMutexHandle(std::shared_ptr<MutexHandle> mutex);

// The mutex of a live mutex handle, or null. The handles the calling thread used last are found
// without the handle table's lock.
std::shared_ptr<MutexHandle> FindMutexHandle(HANDLE handle);

}  // namespace win32::detail
