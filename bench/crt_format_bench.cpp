// The runtime formatting engine against glibc's snprintf and Qt's QString::asprintf on typical
// formats. The string classes format in two passes (measure with _vscwprintf, then
// _vsnwprintf_s into a block of that size): WStrPrintf does exactly that, with the block
// allocated; TwoPass does both passes into a fixed buffer; OnePass* and Measure time one pass.
// glibc gets the narrow form of each format (its fastest case: %s of narrow text for %ls).

#include <benchmark/benchmark.h>

#include <QString>

#include <cstdarg>
#include <cstdint>
#include <cstdio>

#include "win32/crt_format.h"

namespace {

using namespace win32;

MCHAR g_wide[512];
char g_narrow[512];

int WStrPrintf(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const int count = _vscwprintf(format, args);
  auto* block = new MCHAR[static_cast<std::size_t>(count) + 1];
  const int result = _vsnwprintf_s(block, static_cast<std::size_t>(count) + 1, _TRUNCATE, format, args);
  benchmark::DoNotOptimize(block);
  delete[] block;
  va_end(args);
  return result;
}

int TwoPass(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const int count = _vscwprintf(format, args);
  const int result = _vsnwprintf_s(g_wide, static_cast<std::size_t>(count) + 1, _TRUNCATE, format, args);
  va_end(args);
  return result;
}

int OnePassWide(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const int result = _vsnwprintf_s(g_wide, 512, _TRUNCATE, format, args);
  va_end(args);
  return result;
}

int MeasureWide(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const int result = _vscwprintf(format, args);
  va_end(args);
  return result;
}

int OnePassNarrow(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int result = _vsnprintf_s(g_narrow, 512, _TRUNCATE, format, args);
  va_end(args);
  return result;
}

int GlibcSnprintf(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int result = std::vsnprintf(g_narrow, 512, format, args);
  va_end(args);
  return result;
}

qsizetype QtAsprintf(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const QString text = QString::vasprintf(format, args);
  va_end(args);
  return text.size();
}

// One case: the wide form, the same format in narrow form for the engine, glibc's spelling and
// Qt's spelling, each with its arguments.
#define VYN_FORMAT_CASE(Name, Wide, Narrow, Glibc, Qt)                                             \
  void Name##_WStrPrintf(benchmark::State& state) {                                                \
    for (auto _ : state) benchmark::DoNotOptimize(WStrPrintf Wide);                                \
  }                                                                                                \
  void Name##_TwoPass(benchmark::State& state) {                                                   \
    for (auto _ : state) benchmark::DoNotOptimize(TwoPass Wide);                                   \
  }                                                                                                \
  void Name##_OnePassWide(benchmark::State& state) {                                               \
    for (auto _ : state) benchmark::DoNotOptimize(OnePassWide Wide);                               \
  }                                                                                                \
  void Name##_MeasureWide(benchmark::State& state) {                                               \
    for (auto _ : state) benchmark::DoNotOptimize(MeasureWide Wide);                               \
  }                                                                                                \
  void Name##_OnePassNarrow(benchmark::State& state) {                                             \
    for (auto _ : state) benchmark::DoNotOptimize(OnePassNarrow Narrow);                           \
  }                                                                                                \
  void Name##_GlibcSnprintf(benchmark::State& state) {                                             \
    for (auto _ : state) benchmark::DoNotOptimize(GlibcSnprintf Glibc);                            \
  }                                                                                                \
  void Name##_QtAsprintf(benchmark::State& state) {                                                \
    for (auto _ : state) benchmark::DoNotOptimize(QtAsprintf Qt);                                  \
  }                                                                                                \
  BENCHMARK(Name##_WStrPrintf);                                                                    \
  BENCHMARK(Name##_TwoPass);                                                                       \
  BENCHMARK(Name##_OnePassWide);                                                                   \
  BENCHMARK(Name##_MeasureWide);                                                                   \
  BENCHMARK(Name##_OnePassNarrow);                                                                 \
  BENCHMARK(Name##_GlibcSnprintf);                                                                 \
  BENCHMARK(Name##_QtAsprintf)

void* const kPointer = reinterpret_cast<void*>(0x7FFDDEADBEEF);

VYN_FORMAT_CASE(Int, (u"%d", 123456), ("%d", 123456), ("%d", 123456), ("%d", 123456));
VYN_FORMAT_CASE(KeyValue, (u"%s=%d", u"width", 640), ("%s=%d", "width", 640), ("%s=%d", "width", 640),
                ("%s=%d", "width", 640));
VYN_FORMAT_CASE(Fixed, (u"%08.3f", 3.14159), ("%08.3f", 3.14159), ("%08.3f", 3.14159), ("%08.3f", 3.14159));
VYN_FORMAT_CASE(Mixed, (u"Value: %ls (%d items, %.2f%%)", u"widget", 42, 99.5),
                ("Value: %ls (%d items, %.2f%%)", u"widget", 42, 99.5),
                ("Value: %s (%d items, %.2f%%)", "widget", 42, 99.5),
                ("Value: %ls (%d items, %.2f%%)", u"widget", 42, 99.5));
VYN_FORMAT_CASE(Int64, (u"%I64d", 1234567890123LL), ("%I64d", 1234567890123LL), ("%lld", 1234567890123LL),
                ("%lld", 1234567890123LL));
VYN_FORMAT_CASE(Pointer, (u"%p", kPointer), ("%p", kPointer), ("%p", kPointer), ("%p", kPointer));
VYN_FORMAT_CASE(Scientific, (u"%g %e", 0.000123, 6.02e23), ("%g %e", 0.000123, 6.02e23),
                ("%g %e", 0.000123, 6.02e23), ("%g %e", 0.000123, 6.02e23));

}  // namespace

BENCHMARK_MAIN();
