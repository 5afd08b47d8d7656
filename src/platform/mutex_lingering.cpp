// The mutexes kept after their last handle until their owner thread ends.

#include "mutex_lingering.h"

#include <atomic>
#include <mutex>
#include <utility>
#include <vector>

namespace win32::detail {

namespace {

struct Kept {
  MutexState* state;
  std::function<void()> release;
};

struct KeptMutexes {
  std::mutex lock;
  std::vector<Kept> kept;
  std::atomic<bool> any{false};
};

// Never destroyed: handles may be closed from static destructors of other objects.
KeptMutexes& Lingering() {
  static KeptMutexes* mutexes = new KeptMutexes;
  return *mutexes;
}

}  // namespace

void ReleaseWhenUnowned(MutexState* state, std::function<void()> release) {
  if (!IsOwnedInThisProcess(*state)) {
    release();
    return;
  }
  KeptMutexes& mutexes = Lingering();
  std::lock_guard<std::mutex> lock(mutexes.lock);
  mutexes.kept.push_back({state, std::move(release)});
  mutexes.any.store(true, std::memory_order_release);
}

void ReleaseUnownedMutexes() {
  KeptMutexes& mutexes = Lingering();
  if (!mutexes.any.load(std::memory_order_acquire)) return;
  std::vector<Kept> unowned;
  {
    std::lock_guard<std::mutex> lock(mutexes.lock);
    std::erase_if(mutexes.kept, [&](Kept& kept) {
      if (IsOwnedInThisProcess(*kept.state)) return false;
      unowned.push_back(std::move(kept));
      return true;
    });
    mutexes.any.store(!mutexes.kept.empty(), std::memory_order_release);
  }
  for (Kept& kept : unowned) kept.release();
}

}  // namespace win32::detail
