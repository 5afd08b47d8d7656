// Named mutexes: the round trip of a caller that opens a mutex by a name that is open already,
// waits, releases and closes it (as the INI and log-file locks do for every operation); the wait
// and release alone, with the allocations they make; and, for scale, a name that is not open
// yet (shared-memory object joined and left every time) and a bare pthread mutex.

#include <benchmark/benchmark.h>
#include <pthread.h>
#include <unistd.h>

#include <atomic>
#include <cstdlib>
#include <new>
#include <string>

#include "win32/sync.h"
#include "allocation_counter.h"

namespace {


std::u16string Name(const char* stem) {
  const std::string name = stem + std::to_string(getpid());
  return std::u16string(name.begin(), name.end());
}

void RoundTripOfOpenName(benchmark::State& state) {
  const std::u16string name = Name("Vyn.Bench.Open.");
  const HANDLE keeper = win32::CreateMutexW(nullptr, FALSE, name.c_str());
  for (auto _ : state) {
    const HANDLE mutex = win32::CreateMutexW(nullptr, FALSE, name.c_str());
    win32::WaitForSingleObject(mutex, INFINITE);
    win32::ReleaseMutex(mutex);
    win32::CloseHandle(mutex);
  }
  win32::CloseHandle(keeper);
}

void WaitAndRelease(benchmark::State& state) {
  const HANDLE mutex = win32::CreateMutexW(nullptr, FALSE, Name("Vyn.Bench.Wait.").c_str());
  const long before = bench::allocations.load();
  for (auto _ : state) {
    win32::WaitForSingleObject(mutex, INFINITE);
    win32::ReleaseMutex(mutex);
  }
  state.counters["allocations/op"] =
      static_cast<double>(bench::allocations.load() - before) / static_cast<double>(state.iterations());
  win32::CloseHandle(mutex);
}

void RoundTripOfNewName(benchmark::State& state) {
  const std::u16string name = Name("Vyn.Bench.New.");
  for (auto _ : state) {
    const HANDLE mutex = win32::CreateMutexW(nullptr, FALSE, name.c_str());
    win32::WaitForSingleObject(mutex, INFINITE);
    win32::ReleaseMutex(mutex);
    win32::CloseHandle(mutex);
  }
}

void PthreadLockUnlock(benchmark::State& state) {
  pthread_mutex_t mutex = PTHREAD_MUTEX_INITIALIZER;
  for (auto _ : state) {
    pthread_mutex_lock(&mutex);
    pthread_mutex_unlock(&mutex);
  }
}

}  // namespace

BENCHMARK(RoundTripOfOpenName);
BENCHMARK(WaitAndRelease);
BENCHMARK(RoundTripOfNewName);
BENCHMARK(PthreadLockUnlock);

BENCHMARK_MAIN();
