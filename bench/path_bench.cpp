// Path normalisation of a million typical paths, and hits of the resolved-path cache, with the
// allocations each costs.

#include <benchmark/benchmark.h>

#include <atomic>
#include <cstdlib>
#include <new>
#include <string>
#include <vector>

#include "vynutil/path.h"
#include "vynutil/symbol_manager.h"
#include "allocation_counter.h"

namespace {


std::vector<std::u16string> TypicalPaths(int count) {
  static const char16_t* const shapes[] = {
      u"C:/Users/artist/Documents/Project %/scenes/../maps/texture_%.png",
      u"$(ProjectFolder)\\renders\\.\\shot_%\\frame_%.exr",
      u"\\\\fileserver\\assets\\library\\%\\models\\chair_%.max",
      u"sceneassets\\images\\%\\..\\%\\diffuse.tga",
  };
  std::vector<std::u16string> paths;
  paths.reserve(count);
  for (int i = 0; i < count; ++i) {
    std::u16string text = shapes[i % 4];
    const std::u16string number(std::u16string(u"0123456789").substr(0, 1 + i % 10));
    for (std::size_t at; (at = text.find(u'%')) != std::u16string::npos;) text.replace(at, 1, number);
    paths.push_back(text);
  }
  return paths;
}

void NormalizeMillionPaths(benchmark::State& state) {
  const std::vector<std::u16string> texts = TypicalPaths(1'000'000);
  for (auto _ : state) {
    for (const std::u16string& text : texts) {
      VynSDK::Util::Path path(text.c_str());
      benchmark::DoNotOptimize(path.Normalize().GetCStr());
    }
  }
  state.SetItemsProcessed(state.iterations() * static_cast<long>(texts.size()));
}

void ResolvedPathCacheHit(benchmark::State& state) {
  ISymbolManager::GetInstance()->RegisterSymbol(u"ProjectFolder", new StaticSymbolResolver(u"D:\\Work\\Proj"));
  VynSDK::Util::Path path(u"scenes\\..\\maps\\Texture.png");
  path.GetResolvedAbsolutePath();
  const long before = bench::allocations.load();
  for (auto _ : state) benchmark::DoNotOptimize(&path.GetResolvedAbsolutePath());
  state.counters["allocations/hit"] =
      static_cast<double>(bench::allocations.load() - before) / static_cast<double>(state.iterations());
  ISymbolManager::GetInstance()->UnregisterSymbol(u"ProjectFolder");
}

}  // namespace

BENCHMARK(NormalizeMillionPaths)->Unit(benchmark::kMillisecond);
BENCHMARK(ResolvedPathCacheHit);

BENCHMARK_MAIN();
