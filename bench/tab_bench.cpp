// Appending ten million ints one at a time: Tab<int> against std::vector<int>::push_back.

#include <benchmark/benchmark.h>

#include <vector>

#include "vynutil/tab.h"

namespace {

constexpr int kCount = 10'000'000;

void TabAppend(benchmark::State& state) {
  for (auto _ : state) {
    Tab<int> tab;
    for (int i = 0; i < kCount; ++i) tab.Append(1, &i, 0);
    benchmark::DoNotOptimize(tab.Addr(kCount - 1));
  }
}

// Every append through the exported block function, without the template's in-place path.
void TabInsertAtEveryElement(benchmark::State& state) {
  for (auto _ : state) {
    TabHdr* th = nullptr;
    for (int i = 0; i < kCount; ++i) TBInsertAt(&th, i, 1, &i, sizeof(int), 0);
    benchmark::DoNotOptimize(th);
    zfree(reinterpret_cast<void**>(&th));
  }
}

void VectorPushBack(benchmark::State& state) {
  for (auto _ : state) {
    std::vector<int> vector;
    for (int i = 0; i < kCount; ++i) vector.push_back(i);
    benchmark::DoNotOptimize(vector.data());
  }
}

}  // namespace

BENCHMARK(TabAppend)->Unit(benchmark::kMillisecond);
BENCHMARK(TabInsertAtEveryElement)->Unit(benchmark::kMillisecond);
BENCHMARK(VectorPushBack)->Unit(benchmark::kMillisecond);

BENCHMARK_MAIN();
