// The string classes: what a copy, an assignment and a conversion cost, and formatted printing
// side by side with the C library and Qt.
//
//   copy:        WStr copy + release            |  one atomic increment + one decrement
//   assignment:  WStr = other WStr (two blocks) |  the same two atomic operations
//   conversion:  WStr -> CStr / UTF8Str, CStr -> WStr: the first one (new block, form made) and
//                the second one (form cached: share only)
//   printf:      WStr::printf                   |  snprintf into a stack buffer  |  snprintf
//                measured, then into an exactly sized std::string  |  QString::asprintf
//                on the same formats and arguments.

#include <benchmark/benchmark.h>

#include <QString>
#include <atomic>
#include <cstdint>
#include <cstdio>
#include <string>

#include "vynutil/strclass.h"

namespace {

const MCHAR* const kWideText = u"The quick brown fox jumps over the lazy dog, caf\u00E9 na\u00EFve.";
const char* const kNarrowText = "The quick brown fox jumps over the lazy dog, caf\xE9 na\xEFve.";

// ---- copy and assignment ----------------------------------------------------------------------

void BM_AtomicIncrement(benchmark::State& state) {
  std::atomic<std::uint32_t> count{1};
  for (auto _ : state) {
    count.fetch_add(1, std::memory_order_relaxed);
    benchmark::ClobberMemory();
  }
}
BENCHMARK(BM_AtomicIncrement);

// What a copy that is later released costs at the least: the reference count up and down.
void BM_AtomicIncrementDecrement(benchmark::State& state) {
  std::atomic<std::uint32_t> count{1};
  for (auto _ : state) {
    count.fetch_add(1, std::memory_order_relaxed);
    benchmark::ClobberMemory();
    count.fetch_sub(1, std::memory_order_acq_rel);
    benchmark::ClobberMemory();
  }
}
BENCHMARK(BM_AtomicIncrementDecrement);

void BM_WStrCopyAndRelease(benchmark::State& state) {
  const WStr source(kWideText);
  for (auto _ : state) {
    WStr copy(source);
    benchmark::DoNotOptimize(copy);
  }
}
BENCHMARK(BM_WStrCopyAndRelease);

void BM_WStrCopyAssign(benchmark::State& state) {
  const WStr a(kWideText), b(u"another block");
  WStr target = a;
  bool flip = false;
  for (auto _ : state) {
    target = flip ? a : b;  // one increment of the new block, one decrement of the old
    flip = !flip;
    benchmark::DoNotOptimize(target);
  }
}
BENCHMARK(BM_WStrCopyAssign);

void BM_WStrMove(benchmark::State& state) {
  WStr a(kWideText);
  for (auto _ : state) {
    WStr b(std::move(a));
    a = std::move(b);
    benchmark::DoNotOptimize(a);
  }
}
BENCHMARK(BM_WStrMove);

// ---- conversion -------------------------------------------------------------------------------

// Making the block alone, to subtract from the first-conversion rows.
void BM_WStrMake(benchmark::State& state) {
  for (auto _ : state) {
    WStr w(kWideText);
    benchmark::DoNotOptimize(w);
  }
}
BENCHMARK(BM_WStrMake);

void BM_WStrToCStrFirst(benchmark::State& state) {
  for (auto _ : state) {
    WStr w(kWideText);
    CStr c = w.ToCStr();
    benchmark::DoNotOptimize(c);
  }
}
BENCHMARK(BM_WStrToCStrFirst);

void BM_WStrToCStrSecond(benchmark::State& state) {
  const WStr w(kWideText);
  const CStr first = w.ToCStr();
  for (auto _ : state) {
    CStr c = w.ToCStr();  // the cached form: shared, not converted
    benchmark::DoNotOptimize(c);
  }
}
BENCHMARK(BM_WStrToCStrSecond);

void BM_WStrToUTF8StrFirst(benchmark::State& state) {
  for (auto _ : state) {
    WStr w(kWideText);
    UTF8Str u = UTF8Str::FromWStr(w);
    benchmark::DoNotOptimize(u);
  }
}
BENCHMARK(BM_WStrToUTF8StrFirst);

void BM_WStrToUTF8StrSecond(benchmark::State& state) {
  const WStr w(kWideText);
  const UTF8Str first = UTF8Str::FromWStr(w);
  for (auto _ : state) {
    UTF8Str u = UTF8Str::FromWStr(w);
    benchmark::DoNotOptimize(u);
  }
}
BENCHMARK(BM_WStrToUTF8StrSecond);

void BM_CStrToWStrFirst(benchmark::State& state) {
  for (auto _ : state) {
    CStr c(kNarrowText);
    WStr w = c.ToWStr();
    benchmark::DoNotOptimize(w);
  }
}
BENCHMARK(BM_CStrToWStrFirst);

void BM_CStrToWStrSecond(benchmark::State& state) {
  const CStr c(kNarrowText);
  const WStr first = c.ToWStr();
  for (auto _ : state) {
    WStr w = c.ToWStr();
    benchmark::DoNotOptimize(w);
  }
}
BENCHMARK(BM_CStrToWStrSecond);

// ---- printf -----------------------------------------------------------------------------------

// Each format in its wide and narrow spelling, printed with the same arguments.
enum Format { kInt, kMixed, kFloat, kHex };
const char* const kFormatNames[] = {"int", "mixed", "float", "hex"};

int PrintWide(WStr& out, Format f) {
  switch (f) {
    case kInt: return out.printf(u"%d", 1234567);
    case kMixed: return out.printf(u"%s: %d of %d done (%.1f%%)", u"render", 42, 128, 32.8125);
    case kFloat: return out.printf(u"%.6f %g", 3.14159265358979, 2.5e-7);
    case kHex: return out.printf(u"0x%08X %p", 0xBEEFu, static_cast<void*>(&out));
  }
  return 0;
}

int PrintNarrow(char* out, std::size_t size, Format f, void* p) {
  switch (f) {
    case kInt: return std::snprintf(out, size, "%d", 1234567);
    case kMixed: return std::snprintf(out, size, "%s: %d of %d done (%.1f%%)", "render", 42, 128, 32.8125);
    case kFloat: return std::snprintf(out, size, "%.6f %g", 3.14159265358979, 2.5e-7);
    case kHex: return std::snprintf(out, size, "0x%08X %p", 0xBEEFu, p);
  }
  return 0;
}

QString PrintQt(Format f, void* p) {
  switch (f) {
    case kInt: return QString::asprintf("%d", 1234567);
    case kMixed: return QString::asprintf("%s: %d of %d done (%.1f%%)", "render", 42, 128, 32.8125);
    case kFloat: return QString::asprintf("%.6f %g", 3.14159265358979, 2.5e-7);
    case kHex: return QString::asprintf("0x%08X %p", 0xBEEFu, p);
  }
  return {};
}

void BM_PrintfWStr(benchmark::State& state) {
  const auto f = static_cast<Format>(state.range(0));
  state.SetLabel(kFormatNames[f]);
  WStr out;
  for (auto _ : state) benchmark::DoNotOptimize(PrintWide(out, f));
}
BENCHMARK(BM_PrintfWStr)->DenseRange(kInt, kHex);

void BM_PrintfSnprintfStack(benchmark::State& state) {
  const auto f = static_cast<Format>(state.range(0));
  state.SetLabel(kFormatNames[f]);
  char buffer[256];
  for (auto _ : state) {
    benchmark::DoNotOptimize(PrintNarrow(buffer, sizeof(buffer), f, buffer));
    benchmark::ClobberMemory();
  }
}
BENCHMARK(BM_PrintfSnprintfStack)->DenseRange(kInt, kHex);

// What a string class does with snprintf: measure, allocate exactly, format.
void BM_PrintfSnprintfString(benchmark::State& state) {
  const auto f = static_cast<Format>(state.range(0));
  state.SetLabel(kFormatNames[f]);
  char probe = 0;
  for (auto _ : state) {
    const int count = PrintNarrow(nullptr, 0, f, &probe);
    std::string out(static_cast<std::size_t>(count), '\0');
    PrintNarrow(out.data(), out.size() + 1, f, &probe);
    benchmark::DoNotOptimize(out);
  }
}
BENCHMARK(BM_PrintfSnprintfString)->DenseRange(kInt, kHex);

void BM_PrintfQString(benchmark::State& state) {
  const auto f = static_cast<Format>(state.range(0));
  state.SetLabel(kFormatNames[f]);
  char probe = 0;
  for (auto _ : state) {
    QString out = PrintQt(f, &probe);
    benchmark::DoNotOptimize(out);
  }
}
BENCHMARK(BM_PrintfQString)->DenseRange(kInt, kHex);

}  // namespace

BENCHMARK_MAIN();
